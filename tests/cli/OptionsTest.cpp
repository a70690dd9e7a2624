#include <cli/HelpTexts.h>
#include <cli/Options.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <array>
#include <fstream>
#include <sstream>

namespace {

using cli::Command;
using cli::CommandLine;
using cli::Format;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

constexpr std::array allCommands{Command::List,     Command::Names,     Command::Get,   Command::Associators,
                                 Command::Tree,     Command::Capture,   Command::Serve, Command::Passwd,
                                 Command::Register, Command::Unregister};

CommandLine parse(std::vector<std::string> arguments) {
  return cli::parseCommandLine(std::move(arguments));
}

cli::Options parsed(std::vector<std::string> arguments) {
  const CommandLine line = parse(std::move(arguments));
  EXPECT_TRUE(line.options.has_value()) << line.standardError;
  return line.options.value_or(cli::Options());
}

void expectUsageError(std::vector<std::string> arguments, const std::string& message) {
  const CommandLine line = parse(std::move(arguments));
  EXPECT_FALSE(line.options.has_value());
  EXPECT_EQ(line.exitCode, 2);
  EXPECT_EQ(line.standardOutput, "");
  EXPECT_THAT(line.standardError, HasSubstr(message));
  EXPECT_THAT(line.standardError, HasSubstr("--help"));
}

TEST(Options, ListNeedsNothingMore) {
  const cli::Options options = parsed({"list"});
  EXPECT_EQ(options.command, Command::List);
  EXPECT_EQ(options.className, "KELVO_SoftwareIdentity");
  EXPECT_EQ(options.format, Format::Table);
  EXPECT_THAT(options.properties, IsEmpty());
  EXPECT_FALSE(options.inventory || options.systemRoot || options.provider || options.logLevel);
}

TEST(Options, ArgumentsOfEachCommand) {
  EXPECT_EQ(parsed({"list", "CIM_Foo"}).className, "CIM_Foo");
  EXPECT_EQ(parsed({"names", "CIM_Foo"}).className, "CIM_Foo");
  EXPECT_EQ(parsed({"get", "1@3b2"}).object, "1@3b2");
  EXPECT_EQ(parsed({"capture", "-"}).captureFile, "-");
  EXPECT_EQ(parsed({"tree"}).command, Command::Tree);
}

TEST(Options, AssociatorsTakesWhatNarrowsIt) {
  const cli::Options plain = parsed({"associators", "1@3b2"});
  EXPECT_EQ(plain.command, Command::Associators);
  EXPECT_EQ(plain.object, "1@3b2");
  EXPECT_EQ(plain.associationClass + plain.resultClass + plain.role + plain.resultRole, "");
  EXPECT_FALSE(plain.namesOnly);
  const cli::Options narrowed =
      parsed({"associators", "C=x", "--assoc-class", "A", "--result-class", "R", "--role", "From",
              "--result-role", "To", "--names", "--format", "csv", "--provider", "p.so"});
  EXPECT_EQ(narrowed.object, "C=x");
  EXPECT_EQ(narrowed.associationClass, "A");
  EXPECT_EQ(narrowed.resultClass, "R");
  EXPECT_EQ(narrowed.role, "From");
  EXPECT_EQ(narrowed.resultRole, "To");
  EXPECT_TRUE(narrowed.namesOnly);
  EXPECT_EQ(narrowed.format, Format::Csv);
  EXPECT_THAT(parsed({"associators", "1@3b2", "--property", "A,B"}).properties, ElementsAre("A", "B"));
}

TEST(Options, AnArgumentMayBeNamedLikeACommand) {
  EXPECT_EQ(parsed({"capture", "tree"}).captureFile, "tree");
  EXPECT_EQ(parsed({"get", "list"}).object, "list");
}

TEST(Options, OptionsMayStandBeforeOrBehindTheCommand) {
  for (const auto& arguments : std::vector<std::vector<std::string>>{
           {"--format", "json", "list"}, {"list", "--format", "json"}, {"list", "--format=json"}}) {
    EXPECT_EQ(parsed(arguments).format, Format::Json);
  }
}

TEST(Options, PropertiesAreListsAndAddUp) {
  const cli::Options options =
      parsed({"list", "--property", "Name,VersionString", "--property", "InstanceID", "CIM_Foo"});
  EXPECT_THAT(options.properties, ElementsAre("Name", "VersionString", "InstanceID"));
  EXPECT_EQ(options.className, "CIM_Foo");
}

TEST(Options, TheLastOfAnOptionCounts) {
  EXPECT_EQ(parsed({"list", "--format", "json", "--format", "csv"}).format, Format::Csv);
}

TEST(Options, SourcesAndLogging) {
  EXPECT_EQ(parsed({"tree", "--inventory", "a b.json"}).inventory, "a b.json");
  EXPECT_EQ(parsed({"tree", "--system-root", "/r"}).systemRoot, "/r");
  EXPECT_EQ(parsed({"list", "--provider", "x.so"}).provider, "x.so");
  EXPECT_EQ(parsed({"list", "--log-level", "off"}).logLevel, cli::LogLevel::Off);
  EXPECT_EQ(parsed({"list", "--log-level", "error"}).logLevel, cli::LogLevel::Error);
  EXPECT_EQ(parsed({"list", "--log-level", "trace"}).logLevel, cli::LogLevel::Trace);
  EXPECT_TRUE(parsed({"capture", "f", "--force"}).force);
}

TEST(Options, WhatMakesNoSenseIsAUsageError) {
  expectUsageError({}, "no command given");
  expectUsageError({"lst"}, "did you mean 'list'?");
  expectUsageError({"list", "--fromat", "json"}, "did you mean --format?");
  expectUsageError({"list", "A", "B"}, "'B' is one argument too many");
  expectUsageError({"get"}, "needs an InstanceID");
  expectUsageError({"capture"}, "needs a file");
  expectUsageError({"associators"}, "'swinv associators' needs an InstanceID");
  expectUsageError({"asociators", "1@3b2"}, "did you mean 'associators'?");
  for (const char* option : {"--assoc-class", "--result-class", "--role", "--result-role"}) {
    expectUsageError({"associators", "1@3b2", option, ""}, std::string(option) + " needs a name");
    expectUsageError({"associators", "1@3b2", option}, option);
  }
  expectUsageError({"associators", "1@3b2", "--names", "--property", "X"}, "leave out --names or --property");
  expectUsageError({"list", "--format", "xml"}, "'xml' is none of table, json, csv");
  expectUsageError({"list", "--format"}, "--format");
  expectUsageError({"list", "--log-level", "loud"}, "'loud' is none of off, error, trace");
  expectUsageError({"list", ""}, "class is empty");
  expectUsageError({"list", "--inventory", ""}, "--inventory needs a name");
  expectUsageError({"list", "--property", "Name,,X"}, "empty name");
}

TEST(Options, BehindTwoDashesNothingIsAnOption) {
  EXPECT_EQ(parsed({"get", "--inventory", "F", "--", "-1"}).object, "-1");
  expectUsageError({"get", "--", "-1", "--inventory", "F"}, "'--inventory' is one argument too many");
  expectUsageError({"get", "--inventory", "F", "--", "-1", "--inventory=G"},
                   "'--inventory=G' is one argument too many");
  expectUsageError({"get", "--", "-1", "--nothing"}, "'--nothing' is one argument too many");
  expectUsageError({"get", "--inventry", "F", "--", "-1"}, "did you mean --inventory?");
}

TEST(Options, TheVersionTakesNothing) {
  expectUsageError({"--version", "extra"}, "there is no command 'extra'");
  expectUsageError({"--version", "--extra"}, "there is no option --extra");
}

TEST(Options, AnOptionThatACommandDoesNotTakeIsAUsageError) {
  expectUsageError({"names", "--property", "X"}, "'swinv names' takes no --property");
  expectUsageError({"tree", "--provider", "x.so"}, "'swinv tree' takes no --provider");
  expectUsageError({"tree", "--format", "csv"}, "no csv form");
  expectUsageError({"capture", "f", "--format", "json"}, "'swinv capture' takes no --format");
  expectUsageError({"list", "--force"}, "'swinv list' takes no --force");
  expectUsageError({"associators", "1@3b2", "--force"}, "'swinv associators' takes no --force");
  expectUsageError({"get", "1@3b2", "--names"}, "'swinv get' takes no --names");
  for (const char* option : {"--assoc-class", "--result-class", "--role", "--result-role"}) {
    expectUsageError({"list", option, "X"}, std::string("'swinv list' takes no ") + option);
  }
  expectUsageError({"list", "--inventory", "a", "--system-root", "b"}, "name two machines");
}

TEST(Options, VersionAndHelpEndWell) {
  EXPECT_EQ(parse({"--version"}).standardOutput, "swinv " SWINV_VERSION "\n");
  EXPECT_EQ(parse({"--help"}).standardOutput, cli::helpText(std::nullopt));
  EXPECT_EQ(parse({"-h"}).standardOutput, cli::helpText(std::nullopt));
  EXPECT_EQ(parse({"get", "--help"}).standardOutput, cli::helpText(Command::Get));
  EXPECT_EQ(parse({"--help"}).exitCode, 0);
}

/// The manual as it reads, without what only formats it.
std::string manual() {
  std::ifstream file(SWINV_MANUAL);
  std::stringstream text;
  text << file.rdbuf();
  std::string plain = text.str();
  for (std::size_t at = plain.find("\\-"); at != std::string::npos; at = plain.find("\\-", at)) {
    plain.erase(at, 1);
  }
  return plain;
}

/// Every word of `text` that begins like a long option.
std::vector<std::string> optionsIn(std::string_view text) {
  std::vector<std::string> options;
  for (std::size_t at = text.find("--"); at != std::string_view::npos; at = text.find("--", at + 2)) {
    const std::size_t end = text.find_first_not_of("abcdefghijklmnopqrstuvwxyz-", at);
    options.emplace_back(text.substr(at, end - at));
  }
  return options;
}

TEST(Help, HelpAndManualNameEveryOption) {
  const std::string page = manual();
  EXPECT_FALSE(page.empty()) << SWINV_MANUAL;
  EXPECT_GE(cli::optionNames().size(), 9U);
  for (const std::string& option : cli::optionNames()) {
    EXPECT_THAT(optionsIn(cli::helpText(std::nullopt)), testing::Contains(option));
    EXPECT_THAT(optionsIn(page), testing::Contains(option));
  }
}

TEST(Help, HelpAndManualNameNoOptionThatIsNone) {
  std::vector<std::string> texts{manual(), std::string(cli::helpText(std::nullopt))};
  for (const Command command : allCommands) {
    texts.emplace_back(cli::helpText(command));
  }
  for (const std::string& text : texts) {
    EXPECT_THAT(optionsIn(text), testing::Each(testing::AnyOfArray(cli::optionNames())));
  }
}

TEST(Help, TheManualNamesEveryCommand) {
  for (const Command command : allCommands) {
    EXPECT_THAT(manual(), HasSubstr("swinv " + std::string(cli::commandName(command))));
    EXPECT_THAT(std::string(cli::helpText(command)), HasSubstr("Example"));
  }
}

TEST(Help, TheNetworkAssociationIsToldOfByWhereItIsAsked) {
  const std::string associators(cli::helpText(Command::Associators));
  EXPECT_THAT(associators, HasSubstr("all firmware of its device"));
  EXPECT_THAT(associators, HasSubstr("the first port of its device"));
  EXPECT_THAT(associators, HasSubstr("shows the first network device alone"));
  EXPECT_THAT(std::string(cli::helpText(Command::List)),
              HasSubstr("the firmware of the first network device"));
}

TEST(Help, LinesFitATerminal) {
  std::vector<std::optional<Command>> commands(allCommands.begin(), allCommands.end());
  commands.emplace_back();
  for (const std::optional<Command> command : commands) {
    std::istringstream lines{std::string(cli::helpText(command))};
    for (std::string line; std::getline(lines, line);) {
      EXPECT_LE(line.size(), 80U) << line;
    }
  }
}

}  // namespace
