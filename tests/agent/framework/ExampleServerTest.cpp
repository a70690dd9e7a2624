// The sample server that the documentation shows: it holds every kind of node.
#include <agent/framework/InventoryFile.h>
#include <agent/framework/OwnNumbers.h>

#include <Oru/NodeLexicon.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <set>
#include <string>
#include <vector>

namespace agent {
namespace {

using namespace Oru::NodeLexicon;
using ::testing::Contains;
using ::testing::ElementsAre;

class ExampleServer : public ::testing::Test {
 protected:
  const NodeTree tree = readInventoryFile(std::string(EXAMPLES_DIR) + "/server.json");

  [[nodiscard]] std::vector<std::string> descriptions(int type) const {
    std::vector<std::string> all;
    for (const NodeTree::Index node : tree.ofType(type)) {
      all.emplace_back(tree.description(node));
    }
    return all;
  }

  [[nodiscard]] std::size_t childrenOf(NodeTree::Index parent, int type) const {
    const auto nodes = tree.ofType(type);
    return static_cast<std::size_t>(std::count_if(
        nodes.begin(), nodes.end(), [&](NodeTree::Index node) { return tree.parent(node) == parent; }));
  }
};

TEST_F(ExampleServer, IsOneComputer) {
  ASSERT_THAT(tree.ofType(ComputerSystemNode), ElementsAre(0U));
  EXPECT_EQ(tree.number(0), computerNumber);
  EXPECT_TRUE(tree.text(0, NameProperty).has_value());
  EXPECT_EQ(tree.subtreeEnd(0), tree.size());
}

TEST_F(ExampleServer, HasEveryKindOfFirmware) {
  const std::vector<std::string> firmware = descriptions(FirmwareNode);
  for (const char* description :
       {"BIOS", "BMC Firmware", "Baseboard Controller Firmware", "FPGA Firmware", "Diagnostic Firmware",
        "UEFI Shell", "Embedded Controller Firmware", "Drive Firmware", "Host Adapter Firmware",
        "TPM Firmware", "Processor Microcode", "Network Firmware"}) {
    EXPECT_THAT(firmware, Contains(description));
  }
  EXPECT_EQ(std::count(firmware.begin(), firmware.end(), "BIOS"), 1);
  EXPECT_EQ(std::count(firmware.begin(), firmware.end(), "BMC Firmware"), 1);
  EXPECT_EQ(tree.ofType(BiosNode).size(), 1U);
}

TEST_F(ExampleServer, ShowsEachVersionUnderThePropertyThatItsKindSelects) {
  const auto expectVersion = [this](NodeTree::Index node, int property) {
    for (const int other : {FirmwareRevisionProperty, DriverVersionProperty, VersionStringProperty}) {
      EXPECT_EQ(tree.text(node, other).has_value(), other == property)
          << tree.description(node) << ' ' << other;
    }
  };
  for (const NodeTree::Index node : tree.ofType(FirmwareNode)) {
    const std::string_view description = tree.description(node);
    const bool hasRevision = description.find("FPGA Firmware") != std::string_view::npos ||
                             description.find("Baseboard") != std::string_view::npos;
    expectVersion(node, hasRevision ? FirmwareRevisionProperty : VersionStringProperty);
  }
  for (const NodeTree::Index node : tree.ofType(BiosNode)) {
    expectVersion(node, VersionStringProperty);
  }
  for (const NodeTree::Index node : tree.ofType(DriverNode)) {
    expectVersion(node, DriverVersionProperty);
  }
}

TEST_F(ExampleServer, HasDriversDirectlyBelowTheComputer) {
  const auto drivers = tree.ofType(DriverNode);
  ASSERT_GE(drivers.size(), 2U);
  for (const NodeTree::Index node : drivers) {
    EXPECT_EQ(tree.parent(node), 0U);
    EXPECT_TRUE(tree.text(node, DrivenDevicesProperty).has_value());
  }
}

TEST_F(ExampleServer, HasThreeNetworkDevicesThoseWithFirmwareAndPortFirst) {
  const auto devices = tree.ofType(NetworkDeviceNode);
  ASSERT_EQ(devices.size(), 3U);
  std::vector<std::pair<std::size_t, std::size_t>> firmwareAndPorts;
  for (const NodeTree::Index device : devices) {
    EXPECT_EQ(tree.parent(device), 0U);
    firmwareAndPorts.emplace_back(childrenOf(device, FirmwareNode), childrenOf(device, NetworkPortNode));
  }
  EXPECT_THAT(firmwareAndPorts, ElementsAre(std::pair(2U, 2U), std::pair(1U, 1U), std::pair(0U, 1U)));
  EXPECT_LT(tree.position(devices[0]), tree.position(devices[1]));
}

TEST_F(ExampleServer, HasPortsNamedByBusAddressAndPortNumber) {
  std::set<std::string_view> names;
  for (const NodeTree::Index port : tree.ofType(NetworkPortNode)) {
    const std::string_view name = tree.text(port, NameProperty).value_or("");
    EXPECT_TRUE(names.insert(name).second) << "unique in the machine: " << name;
    const std::string bus = std::string(tree.position(tree.parent(port))) + '/';
    EXPECT_EQ(name.substr(0, bus.size()), bus);
    EXPECT_NE(tree.description(port), name) << "the interface name is for display";
  }
  EXPECT_EQ(names.size(), 4U);
}

TEST_F(ExampleServer, HasAnElementWithoutReleaseDateAndOneWithABuild) {
  bool hasDateless = false;
  bool hasBuild = false;
  for (const NodeTree::Index node : tree.ofType(FirmwareNode)) {
    hasDateless |= !tree.text(node, ReleaseDateProperty).has_value();
    hasBuild |= tree.text(node, BuildIdProperty).has_value();
  }
  EXPECT_TRUE(hasDateless);
  EXPECT_TRUE(hasBuild);
}

TEST_F(ExampleServer, SaysWhatWasNotRead) {
  EXPECT_FALSE(tree.reports().empty());
}

TEST_F(ExampleServer, IsTheSameWhenWrittenAndRead) {
  EXPECT_EQ(parseInventory(writeInventory(tree), "again"), tree);
}

}  // namespace
}  // namespace agent
