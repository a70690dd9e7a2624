#include <cli/HelpTexts.h>
#include <cli/OptionRules.h>
#include <cli/UsageError.h>

#include <CLI/CLI.hpp>
#include <algorithm>
#include <array>
#include <string>
#include <vector>

namespace cli {
namespace {

using Commands = std::vector<Command>;

struct Rule {
  const char* option;
  Commands commands;
};

/// An option that is not here is one of every command.
const std::vector<Rule>& rules() {
  static const Commands served{Command::List, Command::Names, Command::Get, Command::Associators,
                               Command::Serve};
  static const Commands ofMachine{Command::List, Command::Names,   Command::Get,  Command::Associators,
                                  Command::Tree, Command::Capture, Command::Serve};
  static const std::vector<Rule> table{
      {"--format", {Command::List, Command::Names, Command::Get, Command::Associators, Command::Tree}},
      {"--property", {Command::List, Command::Get, Command::Associators}},
      {"--inventory", ofMachine},
      {"--system-root", ofMachine},
      {"--log-level", ofMachine},
      {"--provider", served},
      {"--schema", served},
      {"--force", {Command::Capture}},
      {"--assoc-class", {Command::Associators}},
      {"--result-class", {Command::Associators}},
      {"--role", {Command::Associators}},
      {"--result-role", {Command::Associators}},
      {"--names", {Command::Associators}},
      {"--listen", {Command::Serve}},
      {"--tls-certificate", {Command::Serve}},
      {"--tls-key", {Command::Serve}},
      {"--client-ca", {Command::Serve}},
      {"--passwords", {Command::Serve}},
      {"--max-connections", {Command::Serve}},
      {"--stall-time", {Command::Serve}},
      {"--delete", {Command::Passwd}},
      {"--for", {Command::Register, Command::Unregister}},
      {"--print", {Command::Register, Command::Unregister}}};
  return table;
}

}  // namespace

void checkThatOptionsApply(const CLI::App& app, Command command) {
  for (const Rule& rule : rules()) {
    const auto& known = rule.commands;
    if (app.count(rule.option) != 0 && std::find(known.begin(), known.end(), command) == known.end()) {
      throw UsageError("'swinv " + std::string(commandName(command)) + "' takes no " + rule.option);
    }
  }
  if (app.count("--inventory") != 0 && app.count("--system-root") != 0) {
    throw UsageError("--inventory and --system-root name two machines; give one of them");
  }
  if (app.count("--names") != 0 && app.count("--property") != 0) {
    throw UsageError("--names shows no properties; leave out --names or --property");
  }
}

}  // namespace cli
