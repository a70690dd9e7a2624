// What a number depends on, and what a description may steer.
#include "Captures.h"

#include <gtest/gtest.h>

#include <set>

namespace agent::discovery::test {
namespace {

using namespace Oru;

std::shared_ptr<Ethtool> allTelling(const std::string& text) {
  std::map<std::string, FakeEthtool::Told> told;
  for (const char* name : {"ens1", "ens1d1", "eno1", "eno2", "usb0", "renamed0"}) {
    told[name] = {text, text, 0};
  }
  return std::make_shared<FakeEthtool>(std::move(told));
}

/// The numbers of all nodes, by type and position.
std::map<std::pair<int, std::string>, NodeNumber> numbersOf(const NodeTree& tree) {
  std::map<std::pair<int, std::string>, NodeNumber> numbers;
  for (NodeTree::Index node = 0; node < tree.size(); ++node) {
    numbers[{tree.type(node), std::string(tree.position(node))}] = tree.number(node);
  }
  return numbers;
}

TEST(Identity, EveryPositionAndPortIdentifierIsUnique) {
  const Machine machine(server);
  const NodeTree tree = discoverAt(machine, allTelling("1"));
  EXPECT_EQ(numbersOf(tree).size(), tree.size());
  std::set<std::string_view> identifiers;
  for (const NodeTree::Index port : tree.ofType(NodeLexicon::NetworkPortNode)) {
    identifiers.insert(tree.text(port, NodeLexicon::NameProperty).value_or(""));
  }
  EXPECT_EQ(identifiers.size(), 5U);
  EXPECT_FALSE(identifiers.contains(""));
}

TEST(Identity, NumbersAreThoseOfTypeAndPosition) {
  const Machine machine(server);
  const NodeTree tree = discoverAt(machine, allTelling("1"));
  EXPECT_EQ(tree.number(described(tree, "BIOS")), numberFor(NodeLexicon::FirmwareNode, "bios"));
  EXPECT_EQ(tree.number(described(tree, "ens1d1")),
            numberFor(NodeLexicon::NetworkPortNode, "0000:3b:00.0/2"));
  EXPECT_EQ(tree.number(described(tree, "gig driver")), numberFor(NodeLexicon::DriverNode, "driver:gig"));
  EXPECT_EQ(tree.number(tree.parent(described(tree, "ens1d1"))),
            numberFor(NodeLexicon::NetworkDeviceNode, "0000:3b:00.0"));
}

TEST(Identity, NamesAndVersionsChangeNoNumber) {
  Machine machine(server);
  const auto before = numbersOf(discoverAt(machine, allTelling("1")));
  machine.add(R"(
    proc/sys/kernel/hostname = other
    proc/sys/kernel/osrelease = 6.2.0
    sys/devices/virtual/dmi/id/bios_vendor = Sold Inc.
    sys/devices/virtual/dmi/id/bios_version = U42
    sys/devices/virtual/dmi/id/bios_date = 01/01/2025
    sys/devices/virtual/dmi/id/bios_release = 6.0
    sys/module/gig/version = 7
    # the interface ens1 is renamed, and made anew after all others
    sys/class/net/renamed0 -> ../../devices/pci0000:3a/0000:3a:00.0/0000:3b:00.0/net/renamed0
    sys/devices/pci0000:3a/0000:3a:00.0/0000:3b:00.0/net/renamed0/device -> ../../../0000:3b:00.0
    sys/devices/pci0000:3a/0000:3a:00.0/0000:3b:00.0/net/renamed0/dev_port = 0
    sys/devices/pci0000:3a/0000:3a:00.0/0000:3b:00.0/net/renamed0/ifindex = 40
  )");
  machine.remove("sys/class/net/ens1");
  const NodeTree tree = discoverAt(machine, allTelling("2"));
  EXPECT_EQ(numbersOf(tree), before);
  EXPECT_NE(described(tree, "renamed0"), NodeTree::none);
}

TEST(Identity, OtherDevicesChangeNoNumber) {
  Machine machine(server);
  const auto before = numbersOf(discoverAt(machine, allTelling("1")));
  machine.remove("sys/class/net/eno1");
  machine.remove("sys/bus/usb/devices/1-4:1.0");
  machine.add(
      "sys/devices/pci0000:00/0000:01:00.0/subsystem -> ../../../bus/pci\n"
      "sys/class/net/aaa/device -> ../../../devices/pci0000:00/0000:01:00.0");
  const auto after = numbersOf(discoverAt(machine, allTelling("1")));
  std::size_t kept = 0;
  for (const auto& [place, number] : after) {
    const auto known = before.find(place);
    if (known != before.end()) {
      EXPECT_EQ(known->second, number) << place.second;
      ++kept;
    }
  }
  EXPECT_EQ(kept, after.size() - 2) << "the new device and its port";
}

/// The property under which a firmware node's version is looked for.
int versionProperty(std::string_view description) {
  const bool isRevision = description.find("FPGA Firmware") != std::string_view::npos ||
                          description.find("Baseboard") != std::string_view::npos;
  return isRevision ? NodeLexicon::FirmwareRevisionProperty : NodeLexicon::VersionStringProperty;
}

TEST(Identity, EveryFirmwareVersionStandsWhereTheDescriptionSaysItDoes) {
  const Machine machine(server);
  const NodeTree tree = discoverAt(machine, allTelling("1.0"));
  const auto firmware = tree.ofType(NodeLexicon::FirmwareNode);
  EXPECT_EQ(firmware.size(), 5U);
  for (const NodeTree::Index node : firmware) {
    EXPECT_TRUE(tree.text(node, versionProperty(tree.description(node)))) << tree.description(node);
  }
}

TEST(Identity, NoTextOfTheMachineChangesWhatAnElementIs) {
  // Words that steer what firmware counts as, wherever a machine can say them.
  for (const std::string word :
       {"UEFI option ROM", "BIOS", "BMC Firmware", "FPGA Firmware", "Baseboard Diagnostic", "Velmor2"}) {
    Machine machine(server);
    machine.add("proc/sys/kernel/hostname = " + word);
    for (const char* name : {"bios_vendor", "bios_version", "bios_date", "bios_release"}) {
      machine.add("sys/devices/virtual/dmi/id/" + std::string(name) + " = " + word);
    }
    const NodeTree tree = discoverAt(machine, allTelling(word));
    std::multiset<std::string_view> descriptions;
    for (const NodeTree::Index node : tree.ofType(NodeLexicon::FirmwareNode)) {
      descriptions.insert(tree.description(node));
      EXPECT_FALSE(tree.text(node, NodeLexicon::NameProperty)) << "a name can replace the description";
      EXPECT_EQ(tree.text(node, NodeLexicon::VersionStringProperty), word);
    }
    EXPECT_EQ(descriptions.count("BIOS"), 1U) << word;
    EXPECT_EQ(descriptions.count("Network Firmware"), 4U) << word;
    EXPECT_EQ(descriptions.size(), 5U) << word;
  }
}

TEST(Identity, TheSameMachineGivesTheSameTree) {
  const Machine machine(server);
  EXPECT_TRUE(discoverAt(machine, serverEthtool()) == discoverAt(machine, serverEthtool()));
}

}  // namespace
}  // namespace agent::discovery::test
