// The associations as swinv shows them: each class in both directions on the example server. What is expected
// was read off examples/server.json by hand; elements are named by their Name, since InstanceIDs are made of
// numbers that no reader can work out.
#include "Process.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <map>
#include <set>

#include <rapidjson/document.h>

namespace {

using cli_test::linesOf;
using cli_test::Result;
using cli_test::swinv;
using cli_test::testFile;
using testing::ElementsAre;
using testing::ElementsAreArray;
using testing::IsEmpty;
using testing::UnorderedElementsAreArray;

using Names = std::vector<std::string>;
using Pairs = std::vector<std::pair<std::string, std::string>>;

const std::string server = testFile("examples/server.json");

const std::string installed = "KELVO_InstalledSoftwareIdentity";
const std::string bmc = "KELVO_BMCSoftwareIdentity";
const std::string bios = "KELVO_BIOSSoftwareIdentity";
const std::string network = "KELVO_NetworkSoftwareIdentity";

const std::string atlas = "KELVO_ComputerSystem=atlas";
const std::string controller = "KELVO_SPComputerSystem=atlas";
const std::string twinPort1 = "KELVO_NetworkPort=0000:3b:00.0/1";
const std::string twinPort2 = "KELVO_NetworkPort=0000:3b:00.0/2";
const std::string singlePort = "KELVO_NetworkPort=0000:af:00.0/1";
const std::string linkPort = "KELVO_NetworkPort=0000:18:00.0/1";

/// All software of the server: firmware in the order of the file, then what has the type Bios, then drivers.
const Names allSoftware{"System BIOS",
                        "UEFI Shell",
                        "Service Processor",
                        "Mainboard CPLD",
                        "Backplane FPGA",
                        "Preboot Diagnostics",
                        "Fan and Power Controller",
                        "Processor 0 Microcode",
                        "Trusted Platform Module",
                        "Orsella H12",
                        "Halvard D31 Drive",
                        "Halvard V31 Drive",
                        "Velmor V25 Firmware",
                        "Velmor V25 Boot Code",
                        "Kelvo K61 Firmware",
                        "Backup BIOS",
                        "kelvo61",
                        "orsella_hba",
                        "velmor25"};

rapidjson::Document jsonOf(std::vector<std::string> arguments) {
  arguments.insert(arguments.end(), {"--inventory", server, "--format", "json"});
  const Result result = swinv(arguments);
  EXPECT_EQ(result.exitCode, 0) << result.standardError;
  EXPECT_EQ(result.standardError, "");
  rapidjson::Document document;
  document.Parse(result.standardOutput.c_str());
  EXPECT_TRUE(document.IsArray()) << result.standardOutput;
  return document;
}

std::string textOf(const rapidjson::Value& object, const char* member) {
  const auto found = object.FindMember(member);
  return found == object.MemberEnd() ? std::string("(none)") : std::string(found->value.GetString());
}

/// Names for the paths of the server: software by its Name, all else CLASS=KEY.
class Server : public testing::Test {
 protected:
  static void SetUpTestSuite() {
    const rapidjson::Document software = jsonOf({"list"});
    for (const auto& object : software.GetArray()) {
      const std::string id = textOf(object, "InstanceID");
      nameOfPath()["root/cimv2:KELVO_SoftwareIdentity.InstanceID=\"" + id + "\""] = textOf(object, "Name");
      idOfName()[textOf(object, "Name")] = id;
    }
    for (const auto& [className, key] :
         {std::pair("KELVO_ComputerSystem", "Name"), std::pair("KELVO_SPComputerSystem", "Name"),
          std::pair("KELVO_NetworkPort", "DeviceID")}) {
      const rapidjson::Document paths = jsonOf({"names", className});
      for (const auto& object : paths.GetArray()) {
        nameOfPath()[textOf(object, "@path")] = std::string(className) + "=" + textOf(object, key);
      }
    }
  }

  static std::map<std::string, std::string>& nameOfPath() {
    static std::map<std::string, std::string> names;
    return names;
  }
  static std::map<std::string, std::string>& idOfName() {
    static std::map<std::string, std::string> ids;
    return ids;
  }
  static std::string named(const std::string& path) {
    const auto found = nameOfPath().find(path);
    return found == nameOfPath().end() ? "unknown path " + path : found->second;
  }
  /// What people type for an object of the server: CLASS=KEY as it is, the InstanceID of an element by its
  /// Name.
  static std::string typed(const std::string& object) {
    const auto id = idOfName().find(object);
    return id == idOfName().end() ? object : id->second;
  }

  static Names associators(const std::string& object, std::vector<std::string> options) {
    options.insert(options.begin(), {"associators", typed(object)});
    const rapidjson::Document answer = jsonOf(options);
    Names names;
    for (const auto& each : answer.GetArray()) {
      names.push_back(named(textOf(each, "@path")));
    }
    return names;
  }

  /// Instances and paths alike.
  static void expectAssociators(const std::string& object, const std::string& association,
                                const Names& expected) {
    EXPECT_THAT(associators(object, {"--assoc-class", association}), ElementsAreArray(expected)) << object;
    EXPECT_THAT(associators(object, {"--assoc-class", association, "--names"}), ElementsAreArray(expected))
        << object;
  }

  static Pairs pairsOf(const std::string& command, const std::string& association, const char* first,
                       const char* second) {
    const rapidjson::Document answer = jsonOf({command, association});
    Pairs pairs;
    for (const auto& each : answer.GetArray()) {
      pairs.emplace_back(named(textOf(each, first)), named(textOf(each, second)));
    }
    return pairs;
  }

  static void expectPairs(const std::string& association, const char* first, const char* second,
                          const Pairs& expected) {
    EXPECT_THAT(pairsOf("list", association, first, second), ElementsAreArray(expected));
    EXPECT_THAT(pairsOf("names", association, first, second), ElementsAreArray(expected));
  }
};

TEST_F(Server, PublishesTheEndsOfTheAssociations) {
  Names names;
  for (const auto& [path, name] : nameOfPath()) {
    names.push_back(name);
  }
  Names expected = allSoftware;
  expected.insert(expected.end(), {atlas, controller, twinPort1, twinPort2, singlePort, linkPort});
  EXPECT_THAT(names, UnorderedElementsAreArray(expected));
}

TEST_F(Server, InstalledSoftwareFromTheComputerIsAllSoftware) {
  expectAssociators(atlas, installed, allSoftware);
}

TEST_F(Server, InstalledSoftwareFromEachElementIsTheComputer) {
  for (const std::string& element : allSoftware) {
    expectAssociators(element, installed, {atlas});
  }
}

TEST_F(Server, InstalledSoftwareFromWhatIsNeitherEndIsNothing) {
  expectAssociators(controller, installed, {});
  expectAssociators(twinPort1, installed, {});
}

TEST_F(Server, InstalledSoftwareListsEachElementWithTheComputer) {
  Pairs pairs;
  for (const std::string& element : allSoftware) {
    pairs.emplace_back(atlas, element);
  }
  expectPairs(installed, "System", "InstalledSoftware", pairs);
}

TEST_F(Server, BmcFirmwareInBothDirections) {
  expectAssociators(controller, bmc, {"Service Processor"});
  expectAssociators("Service Processor", bmc, {controller});
  expectPairs(bmc, "Antecedent", "Dependent", {{controller, "Service Processor"}});
}

TEST_F(Server, BmcFirmwareIsNoOtherFirmware) {
  for (const std::string& element : allSoftware) {
    if (element != "Service Processor") {
      expectAssociators(element, bmc, {});
    }
  }
  expectAssociators(atlas, bmc, {});
  expectAssociators(twinPort1, bmc, {});
}

TEST_F(Server, BiosInBothDirections) {
  expectAssociators(atlas, bios, {"System BIOS"});
  expectAssociators("System BIOS", bios, {atlas});
  expectPairs(bios, "Antecedent", "Dependent", {{atlas, "System BIOS"}});
}

TEST_F(Server, BiosIsNoOtherFirmware) {
  for (const std::string& element : allSoftware) {
    if (element != "System BIOS") {
      expectAssociators(element, bios, {});
    }
  }
  expectAssociators(controller, bios, {});
}

TEST_F(Server, NetworkFirmwareFromEachPortIsAllOfItsDevice) {
  expectAssociators(twinPort1, network, {"Velmor V25 Firmware", "Velmor V25 Boot Code"});
  expectAssociators(twinPort2, network, {"Velmor V25 Firmware", "Velmor V25 Boot Code"});
  expectAssociators(singlePort, network, {"Kelvo K61 Firmware"});
  expectAssociators(linkPort, network, {});
}

TEST_F(Server, NetworkFirmwareServesTheFirstPortOfItsDeviceAlone) {
  expectAssociators("Velmor V25 Firmware", network, {twinPort1});
  expectAssociators("Velmor V25 Boot Code", network, {twinPort1});
  expectAssociators("Kelvo K61 Firmware", network, {singlePort});
}

TEST_F(Server, NetworkFirmwareIsNoOtherFirmware) {
  const std::set<std::string> networkFirmware{"Velmor V25 Firmware", "Velmor V25 Boot Code",
                                              "Kelvo K61 Firmware"};
  for (const std::string& element : allSoftware) {
    if (networkFirmware.count(element) == 0) {
      expectAssociators(element, network, {});
    }
  }
  expectAssociators(atlas, network, {});
}

TEST_F(Server, NetworkFirmwareListsTheFirstDeviceAlone) {
  expectPairs(network, "Antecedent", "Dependent",
              {{"Velmor V25 Firmware", twinPort1}, {"Velmor V25 Boot Code", twinPort1}});
}

TEST_F(Server, WithoutAClassEveryAssociationAnswersAndEachObjectComesOnce) {
  EXPECT_THAT(associators("velmor25", {}), ElementsAre(atlas));
  EXPECT_THAT(associators("System BIOS", {}), ElementsAre(atlas));
  EXPECT_THAT(associators("Service Processor", {}), UnorderedElementsAreArray(Names{atlas, controller}));
  EXPECT_THAT(associators("Kelvo K61 Firmware", {}), UnorderedElementsAreArray(Names{atlas, singlePort}));
  EXPECT_THAT(associators(controller, {}), ElementsAre("Service Processor"));
  EXPECT_THAT(associators(singlePort, {}), ElementsAre("Kelvo K61 Firmware"));
  EXPECT_THAT(associators(atlas, {"--names"}), UnorderedElementsAreArray(allSoftware));
}

TEST_F(Server, AnAncestorOfAssociationsStandsForThem) {
  const Names options{"--assoc-class", "CIM_ElementSoftwareIdentity"};
  EXPECT_THAT(associators("Service Processor", options), ElementsAre(controller));
  EXPECT_THAT(associators("System BIOS", options), ElementsAre(atlas));
  EXPECT_THAT(associators("velmor25", options), IsEmpty());
  EXPECT_THAT(associators("Velmor V25 Firmware", {"--assoc-class", "CIM_Dependency"}),
              ElementsAre(twinPort1));
  Pairs pairs = pairsOf("list", "CIM_ElementSoftwareIdentity", "Antecedent", "Dependent");
  EXPECT_THAT(pairs, UnorderedElementsAreArray(Pairs{{controller, "Service Processor"},
                                                     {atlas, "System BIOS"},
                                                     {"Velmor V25 Firmware", twinPort1},
                                                     {"Velmor V25 Boot Code", twinPort1}}));
}

TEST_F(Server, TheResultClassNarrowsWithItsSubclasses) {
  EXPECT_THAT(associators("Service Processor", {"--result-class", "KELVO_SPComputerSystem"}),
              ElementsAre(controller));
  EXPECT_THAT(associators("Service Processor", {"--result-class", "cim_computersystem"}),
              UnorderedElementsAreArray(Names{atlas, controller}));
  EXPECT_THAT(associators("Kelvo K61 Firmware", {"--result-class", "CIM_NetworkPort"}),
              ElementsAre(singlePort));
  EXPECT_THAT(associators("Kelvo K61 Firmware", {"--result-class", "CIM_SoftwareIdentity"}), IsEmpty());
  EXPECT_THAT(associators(singlePort, {"--result-class", "CIM_SoftwareIdentity", "--names"}),
              ElementsAre("Kelvo K61 Firmware"));
}

TEST_F(Server, RolesNarrowByTheReferencesAsTheyAreDelivered) {
  // The firmware of the controller is the Dependent, that of a network device the Antecedent.
  EXPECT_THAT(associators("Service Processor", {"--role", "Dependent"}), ElementsAre(controller));
  EXPECT_THAT(associators("Service Processor", {"--role", "Antecedent"}), IsEmpty());
  EXPECT_THAT(associators("Service Processor", {"--role", "InstalledSoftware"}), ElementsAre(atlas));
  EXPECT_THAT(associators("Kelvo K61 Firmware", {"--role", "antecedent"}), ElementsAre(singlePort));
  EXPECT_THAT(associators("Kelvo K61 Firmware", {"--role", "Dependent"}), IsEmpty());
  EXPECT_THAT(associators(atlas, {"--role", "Antecedent", "--names"}), ElementsAre("System BIOS"));
}

TEST_F(Server, ResultRolesNarrowByTheReferencesAsTheyAreDelivered) {
  EXPECT_THAT(associators("Service Processor", {"--result-role", "Antecedent"}), ElementsAre(controller));
  EXPECT_THAT(associators("Service Processor", {"--result-role", "System"}), ElementsAre(atlas));
  EXPECT_THAT(associators("Kelvo K61 Firmware", {"--result-role", "Dependent"}), ElementsAre(singlePort));
  EXPECT_THAT(associators(singlePort, {"--result-role", "Dependent"}), IsEmpty());
  EXPECT_THAT(associators(atlas, {"--result-role", "Dependent", "--names"}), ElementsAre("System BIOS"));
  EXPECT_THAT(associators(atlas, {"--role", "System", "--result-role", "InstalledSoftware"}),
              ElementsAreArray(allSoftware));
}

/// What follows a line's first ";" in a tree, by the Name in parentheses or the last word of the description.
std::map<std::string, std::string> marksOf(const std::string& tree) {
  std::map<std::string, std::string> marks;
  for (const std::string& line : linesOf(tree)) {
    const std::size_t mark = line.find("; ");
    if (mark != std::string::npos) {
      marks[line.substr(0, mark)] = line.substr(mark + 2, line.find("  [") - mark - 2);
    }
  }
  return marks;
}

TEST_F(Server, TheTreeMarksWhatTheAssociationsAnswer) {
  const Result tree = swinv({"tree", "--inventory", server});
  const auto marks = marksOf(tree.standardOutput);
  EXPECT_EQ(marks.size(), allSoftware.size());
  for (const auto& [line, mark] : marks) {
    std::string expected = "on atlas";
    if (line.find("(System BIOS)") != std::string::npos) {
      expected = "on atlas, is its BIOS";
    } else if (line.find("(Service Processor)") != std::string::npos) {
      expected = "on atlas, runs its service processor";
    } else if (line.find("(Velmor V25 Firmware)") != std::string::npos ||
               line.find("(Velmor V25 Boot Code)") != std::string::npos) {
      expected = "on atlas, serves port 0000:3b:00.0/1";
    } else if (line.find("(Kelvo K61 Firmware)") != std::string::npos) {
      expected = "on atlas, serves port 0000:af:00.0/1";
    }
    EXPECT_EQ(mark, expected) << line;
  }
}

}  // namespace
