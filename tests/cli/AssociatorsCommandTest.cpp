// How swinv associators prints and fails, and that what is printed can be typed back.
#include "Process.h"

#include <cli/Text.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <rapidjson/document.h>

namespace {

using cli_test::linesOf;
using cli_test::Result;
using cli_test::runOnTerminal;
using cli_test::swinv;
using cli_test::testFile;
using testing::AllOf;
using testing::EndsWith;
using testing::HasSubstr;
using testing::Not;
using testing::SizeIs;
using testing::StartsWith;

const std::string ends = testFile("tests/cli/ends.json");

/// Asks about the machine of ends.json, whose numbers are written in the file.
Result ask(std::vector<std::string> arguments) {
  arguments.insert(arguments.end(), {"--inventory", ends});
  return swinv(arguments);
}

std::string answer(std::vector<std::string> arguments) {
  const Result result = ask(std::move(arguments));
  EXPECT_EQ(result.exitCode, 0);
  EXPECT_EQ(result.standardError, "");
  return result.standardOutput;
}

template <typename Matcher>
void expectFailure(const Result& result, const Matcher& message) {
  EXPECT_EQ(result.exitCode, 1);
  EXPECT_EQ(result.standardOutput, "");
  EXPECT_THAT(result.standardError, AllOf(StartsWith("swinv: "), message));
}

const std::string hostPath =
    R"(root/cimv2:KELVO_ComputerSystem.CreationClassName="KELVO_ComputerSystem",Name="host")";
const std::string controllerPath =
    R"(root/cimv2:KELVO_SPComputerSystem.CreationClassName="KELVO_SPComputerSystem",Name="host")";
const std::string portPath =
    R"(root/cimv2:KELVO_NetworkPort.SystemCreationClassName="KELVO_ComputerSystem",SystemName="host",)"
    R"(CreationClassName="KELVO_NetworkPort",DeviceID="card/1")";
const std::string bmcPath = R"(root/cimv2:KELVO_SoftwareIdentity.InstanceID="1@b")";
const std::string cardFirmwarePath = R"(root/cimv2:KELVO_SoftwareIdentity.InstanceID="16@f")";

/// A path as it stands in quotes in another.
std::string quoted(const std::string& path) {
  std::string text;
  for (const char c : path) {
    text.append(c == '"' || c == '\\' ? "\\" : "").push_back(c);
  }
  return text;
}

TEST(AssociatorsCommand, NamesAreOnePathALine) {
  EXPECT_EQ(answer({"associators", "1@b", "--names"}), hostPath + "\n" + controllerPath + "\n");
  EXPECT_EQ(answer({"associators", "16@f", "--names", "--assoc-class", "KELVO_NetworkSoftwareIdentity"}),
            portPath + "\n");
}

TEST(AssociatorsCommand, EveryFormOfAnObjectAsksTheSame) {
  const std::string expected = cardFirmwarePath + "\n";
  for (const char* typed :
       {"KELVO_NetworkPort=card/1", "kelvo_networkport=card/1", "CIM_NetworkPort=card/1"}) {
    EXPECT_EQ(answer({"associators", typed, "--names"}), expected) << typed;
  }
  EXPECT_EQ(answer({"associators", portPath, "--names"}), expected);
  EXPECT_EQ(answer({"associators", portPath.substr(portPath.find(':') + 1), "--names"}), expected);
  const std::string computer = hostPath + "\n";
  for (const char* typed : {"1@d", "KELVO_SoftwareIdentity=1@d", "KELVO_SoftwareIdentity.InstanceID=\"1@d\"",
                            "root/cimv2:KELVO_SoftwareIdentity.InstanceID=\"1@d\""}) {
    EXPECT_EQ(answer({"associators", typed, "--names"}), computer) << typed;
  }
}

TEST(AssociatorsCommand, SoftwareIsATableAsListPrintsIt) {
  EXPECT_EQ(answer({"associators", "KELVO_NetworkPort=card/1"}),
            "InstanceID  Description       VersionString  Classifications\n"
            "16@f        Network Firmware  7.0            Firmware\n");
}

TEST(AssociatorsCommand, EachClassIsATableUnderItsName) {
  const auto lines = linesOf(answer({"associators", "16@f"}));
  ASSERT_THAT(lines, SizeIs(7));
  EXPECT_EQ(lines[0], "KELVO_ComputerSystem:");
  EXPECT_THAT(lines[1], StartsWith("@path                      "));
  EXPECT_THAT(lines[2], StartsWith("KELVO_ComputerSystem=host  "));
  EXPECT_EQ(lines[3], "");
  EXPECT_EQ(lines[4], "KELVO_NetworkPort:");
  EXPECT_THAT(lines[5], AllOf(StartsWith("@path                     "), Not(HasSubstr("ClassName"))));
  EXPECT_THAT(lines[6], StartsWith("KELVO_NetworkPort=card/1  "));
}

TEST(AssociatorsCommand, OneClassIsATableWithoutAHeading) {
  const auto lines = linesOf(answer({"associators", "1@d"}));
  ASSERT_THAT(lines, SizeIs(2));
  EXPECT_THAT(lines[0], StartsWith("@path"));
  EXPECT_THAT(lines[1], StartsWith("KELVO_ComputerSystem=host"));
}

TEST(AssociatorsCommand, TablesFitTheTerminal) {
  for (const unsigned short width : std::initializer_list<unsigned short>{40, 80, 120}) {
    const Result result = runOnTerminal({{"associators", "16@f", "--inventory", ends}}, width);
    EXPECT_EQ(result.exitCode, 0);
    EXPECT_THAT(result.standardOutput,
                AllOf(HasSubstr("KELVO_ComputerSystem=host"), HasSubstr("KELVO_NetworkPort=card/1")));
    for (const std::string& line : linesOf(result.standardOutput)) {
      EXPECT_LE(cli::displayWidth(line.substr(0, line.find('\r'))), width) << line;
    }
  }
}

TEST(AssociatorsCommand, PropertiesMakeOneTableOfAllClasses) {
  EXPECT_EQ(answer({"associators", "16@f", "--property", "deviceid,ElementName"}),
            "DeviceID  ElementName\n"
            "          host\n"
            "card/1    eth0\n");
  EXPECT_EQ(answer({"associators", "16@f", "--property", "DeviceID,CreationClassName", "--format", "csv"}),
            "DeviceID,CreationClassName\r\n"
            ",KELVO_ComputerSystem\r\n"
            "card/1,KELVO_NetworkPort\r\n");
}

TEST(AssociatorsCommand, JsonIsOneListOfObjectsWithTheirPaths) {
  rapidjson::Document document;
  document.Parse(answer({"associators", "16@f", "--format", "json"}).c_str());
  ASSERT_TRUE(document.IsArray());
  ASSERT_EQ(document.Size(), 2U);
  EXPECT_STREQ(document[0].MemberBegin()->name.GetString(), "@path");
  EXPECT_EQ(document[0]["@path"].GetString(), hostPath);
  EXPECT_STREQ(document[0]["Name"].GetString(), "host");
  EXPECT_FALSE(document[0].HasMember("DeviceID"));
  EXPECT_EQ(document[1]["@path"].GetString(), portPath);
  EXPECT_STREQ(document[1]["DeviceID"].GetString(), "card/1");
  EXPECT_STREQ(document[1]["CreationClassName"].GetString(), "KELVO_NetworkPort");
}

TEST(AssociatorsCommand, JsonHasTheMembersThatWereAskedFor) {
  EXPECT_EQ(answer({"associators", "16@f", "--format", "json", "--property", "DeviceID,CreationClassName"}),
            R"([
  {
    "CreationClassName": "KELVO_ComputerSystem"
  },
  {
    "CreationClassName": "KELVO_NetworkPort",
    "DeviceID": "card/1"
  }
]
)");
  EXPECT_EQ(
      answer({"associators", "KELVO_NetworkPort=card/1", "--names", "--format", "json"}),
      "[\n  {\n    \"@path\": \"" + quoted(cardFirmwarePath) + "\",\n    \"InstanceID\": \"16@f\"\n  }\n]\n");
}

TEST(AssociatorsCommand, CsvColumnsAreTheSameForEveryObject) {
  const auto header = [](const std::string& object) {
    const std::string text = answer({"associators", object, "--format", "csv"});
    return text.substr(0, text.find('\r'));
  };
  const std::string columns = header("16@f");
  EXPECT_THAT(columns, StartsWith("@path,"));
  for (const char* name : {"InstanceID", "VersionString", "Dedicated", "DeviceID", "PermanentAddress"}) {
    EXPECT_THAT("," + columns + ",", HasSubstr("," + std::string(name) + ","));
  }
  EXPECT_EQ(header("KELVO_NetworkPort=card/1"), columns);
  EXPECT_EQ(header("KELVO_ComputerSystem=host"), columns);
}

TEST(AssociatorsCommand, CsvColumnsFollowTheResultClass) {
  const std::string text =
      answer({"associators", "16@f", "--result-class", "CIM_SoftwareIdentity", "--format", "csv"});
  EXPECT_THAT(text, AllOf(StartsWith("@path,InstanceID,"), HasSubstr(",VersionString,"),
                          EndsWith(",BuildID\r\n"), Not(HasSubstr("DeviceID"))));
  EXPECT_EQ(
      answer({"associators", "1@b", "--names", "--result-class", "CIM_ComputerSystem", "--format", "csv"})
          .substr(0, 30),
      "@path,Name,CreationClassName\r\n");
}

TEST(AssociatorsCommand, NothingIsAnAnswer) {
  const std::vector<std::string> question{"associators", "1@d", "--assoc-class", "KELVO_BMCSoftwareIdentity"};
  EXPECT_EQ(answer(question), "");
  std::vector<std::string> json = question;
  json.insert(json.end(), {"--format", "json"});
  EXPECT_EQ(answer(json), "[]\n");
  EXPECT_EQ(
      answer({"associators", "KELVO_NetworkPort=card/2", "--assoc-class", "KELVO_BIOSSoftwareIdentity"}), "");
}

TEST(RoundTrip, ReferencesInTablesCanBeTypedBack) {
  EXPECT_EQ(answer({"list", "KELVO_InstalledSoftwareIdentity"}),
            "System                     InstalledSoftware\n"
            "KELVO_ComputerSystem=host  1@a\n"
            "KELVO_ComputerSystem=host  1@b\n"
            "KELVO_ComputerSystem=host  16@f\n"
            "KELVO_ComputerSystem=host  1@d\n");
  EXPECT_EQ(answer({"list", "KELVO_BIOSSoftwareIdentity"}),
            "Antecedent                 Dependent\n"
            "KELVO_ComputerSystem=host  1@a\n");
  EXPECT_EQ(answer({"list", "KELVO_BMCSoftwareIdentity"}),
            "Antecedent                   Dependent\n"
            "KELVO_SPComputerSystem=host  1@b\n");
  EXPECT_EQ(answer({"list", "KELVO_NetworkSoftwareIdentity"}),
            "Antecedent  Dependent\n"
            "16@f        KELVO_NetworkPort=card/1\n");
  for (const char* object : {"KELVO_ComputerSystem=host", "KELVO_SPComputerSystem=host",
                             "KELVO_NetworkPort=card/1", "1@a", "1@b", "16@f", "1@d"}) {
    EXPECT_NE(answer({"get", object}), "") << object;
    EXPECT_NE(answer({"associators", object}), "") << object;
  }
}

TEST(RoundTrip, ReferencesInJsonAndCsvAreWholePaths) {
  EXPECT_EQ(answer({"list", "KELVO_BMCSoftwareIdentity", "--format", "json"}),
            "[\n  {\n    \"Antecedent\": \"" + quoted(controllerPath) + "\",\n    \"Dependent\": \"" +
                quoted(bmcPath) + "\"\n  }\n]\n");
  EXPECT_EQ(
      answer({"list", "KELVO_NetworkSoftwareIdentity", "--property", "Dependent", "--format", "csv"}),
      "Dependent\r\n"
      "\"root/cimv2:KELVO_NetworkPort.SystemCreationClassName=\"\"KELVO_ComputerSystem\"\","
      "SystemName=\"\"host\"\",CreationClassName=\"\"KELVO_NetworkPort\"\",DeviceID=\"\"card/1\"\"\"\r\n");
}

TEST(RoundTrip, EveryPathThatIsPrintedHasItsInstanceAndItsAssociators) {
  for (const char* className :
       {"KELVO_SoftwareIdentity", "KELVO_ComputerSystem", "KELVO_SPComputerSystem", "KELVO_NetworkPort"}) {
    const auto paths = linesOf(answer({"names", className}));
    EXPECT_FALSE(paths.empty()) << className;
    for (const std::string& path : paths) {
      EXPECT_NE(answer({"get", path}), "") << path;
      for (const std::string& far : linesOf(answer({"associators", path, "--names"}))) {
        EXPECT_NE(answer({"get", far}), "") << far;
        // From firmware, the second port of its device is not reached.
        if (!path.ends_with("card/2\"")) {
          EXPECT_THAT(linesOf(answer({"associators", far, "--names"})), testing::Contains(path)) << far;
        }
      }
    }
  }
}

TEST(RoundTrip, AnInstalledSoftwareAssociationIsFetchedByItsPath) {
  const auto paths = linesOf(answer({"names", "KELVO_InstalledSoftwareIdentity"}));
  ASSERT_THAT(paths, SizeIs(4));
  EXPECT_EQ(paths[1], "root/cimv2:KELVO_InstalledSoftwareIdentity.System=\"" + quoted(hostPath) +
                          "\",InstalledSoftware=\"" + quoted(bmcPath) + "\"");
  EXPECT_EQ(answer({"get", paths[1]}),
            "System             KELVO_ComputerSystem=host\n"
            "InstalledSoftware  1@b\n");
}

TEST(RoundTrip, TheOtherAssociationsAreNotFetchedSingly) {
  for (const std::string className :
       {"KELVO_BMCSoftwareIdentity", "KELVO_BIOSSoftwareIdentity", "KELVO_NetworkSoftwareIdentity"}) {
    const auto paths = linesOf(answer({"names", className}));
    ASSERT_THAT(paths, SizeIs(1)) << className;
    expectFailure(ask({"get", paths.front()}),
                  AllOf(HasSubstr("CIM_ERR_NOT_SUPPORTED"), HasSubstr("gives no single " + className),
                        HasSubstr("swinv list " + className)));
  }
}

TEST(AssociatorsFailure, WhatIsNotThereIsNotFound) {
  expectFailure(ask({"associators", "1@beef"}), AllOf(HasSubstr("CIM_ERR_NOT_FOUND"), HasSubstr("1@beef")));
  expectFailure(ask({"associators", "KELVO_SoftwareIdentity.InstanceID=\"1@beef\"", "--names"}),
                HasSubstr("CIM_ERR_NOT_FOUND"));
  for (const char* command : {"get", "associators"}) {
    expectFailure(
        ask({command, "KELVO_NetworkPort=card/9"}),
        AllOf(HasSubstr("CIM_ERR_NOT_FOUND"), HasSubstr("no KELVO_NetworkPort has the DeviceID 'card/9'"),
              HasSubstr("swinv names KELVO_NetworkPort")));
  }
}

TEST(AssociatorsFailure, AShortFormThatNamesSeveralObjectsListsThem) {
  expectFailure(ask({"associators", "CIM_ComputerSystem=host"}),
                AllOf(HasSubstr("2 objects have this Name"), HasSubstr(hostPath), HasSubstr(controllerPath)));
}

TEST(AssociatorsFailure, AShortFormNeedsAClassWithOneTellingKey) {
  expectFailure(
      ask({"associators", "KELVO_BMCSoftwareIdentity=host"}),
      AllOf(HasSubstr("CIM_ERR_INVALID_PARAMETER"), HasSubstr("swinv names KELVO_BMCSoftwareIdentity")));
}

TEST(AssociatorsFailure, UnknownClassesAreNamed) {
  for (const char* option : {"--assoc-class", "--result-class"}) {
    expectFailure(
        ask({"associators", "1@b", option, "KELVO_BMCSoftwareIdentty"}),
        AllOf(HasSubstr("CIM_ERR_INVALID_CLASS"), HasSubstr("did you mean KELVO_BMCSoftwareIdentity?")));
  }
  expectFailure(ask({"associators", "KELVO_NetworkPrt=card/1"}),
                AllOf(HasSubstr("CIM_ERR_INVALID_CLASS"), HasSubstr("did you mean KELVO_NetworkPort?")));
  expectFailure(ask({"associators", "Nonsense.Key=\"x\""}), HasSubstr("CIM_ERR_INVALID_CLASS"));
}

TEST(AssociatorsFailure, AClassThatIsNoAssociationIsToldOf) {
  expectFailure(
      ask({"associators", "1@b", "--assoc-class", "KELVO_NetworkPort"}),
      AllOf(HasSubstr("CIM_ERR_INVALID_PARAMETER"), HasSubstr("KELVO_NetworkPort is no association"),
            HasSubstr("KELVO_InstalledSoftwareIdentity")));
}

TEST(AssociatorsFailure, UnknownRolesAreNamed) {
  for (const char* option : {"--role", "--result-role"}) {
    expectFailure(ask({"associators", "1@b", option, "Dependant"}),
                  AllOf(HasSubstr("CIM_ERR_INVALID_PARAMETER"), HasSubstr(option),
                        HasSubstr("did you mean Dependent?")));
    expectFailure(ask({"associators", "1@b", option, "Foo"}), HasSubstr("there are Antecedent, Dependent"));
    expectFailure(ask({"associators", "1@b", option, "System", "--assoc-class", "KELVO_BMCSoftwareIdentity"}),
                  HasSubstr("there are Antecedent, Dependent"));
  }
}

TEST(AssociatorsFailure, PropertiesThatNoClassHasAreNamed) {
  expectFailure(ask({"associators", "1@b", "--property", "DevceID"}),
                AllOf(HasSubstr("CIM_ERR_NO_SUCH_PROPERTY"), HasSubstr("did you mean DeviceID?")));
  expectFailure(
      ask({"associators", "1@b", "--property", "DeviceID", "--result-class", "KELVO_SoftwareIdentity"}),
      AllOf(HasSubstr("CIM_ERR_NO_SUCH_PROPERTY"), HasSubstr("KELVO_SoftwareIdentity has no property")));
}

TEST(AssociatorsFailure, KeysThatDoNotFitTheClassAreInvalid) {
  expectFailure(ask({"associators", "KELVO_SoftwareIdentity.Foo=\"1@b\""}),
                AllOf(HasSubstr("CIM_ERR_INVALID_PARAMETER"), HasSubstr("InstanceID")));
}

TEST(AssociatorsFailure, AWrongCommandLineIsTwo) {
  EXPECT_EQ(ask({"associators"}).exitCode, 2);
  EXPECT_EQ(ask({"associators", "1@b", "--names", "--property", "Name"}).exitCode, 2);
  EXPECT_EQ(ask({"associators", "1@b", "--role", ""}).exitCode, 2);
}

TEST(AssociatorsFailure, ABrokenInventoryIsNamedWithLineAndField) {
  const std::string broken = testFile("tests/cli/broken.json");
  for (const char* object : {"1@2a", "KELVO_ComputerSystem=alpha", "KELVO_NetworkPort.DeviceID=\"x\""}) {
    expectFailure(swinv({"associators", object, "--inventory", broken}), HasSubstr("broken.json:6"));
  }
}

TEST(EndsOfAssociations, TablesShowWhatTellsThemApart) {
  const auto computers = linesOf(answer({"list", "KELVO_ComputerSystem"}));
  ASSERT_THAT(computers, SizeIs(2));
  EXPECT_THAT(computers[0], AllOf(StartsWith("Name "), Not(HasSubstr("CreationClassName"))));
  EXPECT_THAT(computers[1], StartsWith("host "));
  const auto ports = linesOf(answer({"list", "KELVO_NetworkPort"}));
  ASSERT_THAT(ports, SizeIs(3));
  EXPECT_THAT(ports[0], AllOf(StartsWith("DeviceID "), EndsWith(" SystemName")));
  EXPECT_THAT(ports[1], AllOf(StartsWith("card/1 "), EndsWith(" host")));
  EXPECT_THAT(ports[2], AllOf(StartsWith("card/2 "), EndsWith(" host")));
}

TEST(EndsOfAssociations, PathsHaveEveryKey) {
  EXPECT_EQ(answer({"names", "KELVO_ComputerSystem"}), hostPath + "\n");
  EXPECT_EQ(answer({"names", "KELVO_SPComputerSystem"}), controllerPath + "\n");
  const auto ports = linesOf(answer({"names", "KELVO_NetworkPort"}));
  ASSERT_THAT(ports, SizeIs(2));
  EXPECT_EQ(ports.front(), portPath);
}

TEST(EndsOfAssociations, TheLiveMachineHasAComputerWithItsSoftware) {
  const Result computers = swinv({"names", "KELVO_ComputerSystem"});
  EXPECT_EQ(computers.exitCode, 0) << computers.standardError;
  const auto paths = linesOf(computers.standardOutput);
  ASSERT_THAT(paths, SizeIs(1));
  const Result software = swinv({"associators", paths.front(), "--names"});
  EXPECT_EQ(software.exitCode, 0) << software.standardError;
  EXPECT_EQ(software.standardOutput, swinv({"names"}).standardOutput);
}

}  // namespace
