#include <agent/discovery/network/PortFacts.h>
#include <agent/framework/OwnNumbers.h>

#include <gtest/gtest.h>

#include <cerrno>

#include "Machine.h"

namespace agent::discovery::test {
namespace {

TEST(LinkTechnology, IsTheKernelsHardwareTypeInWordsOfCim) {
  EXPECT_EQ(linkTechnology(1, "INTERFACE=eno1\nIFINDEX=2\n"), "Ethernet");
  EXPECT_EQ(linkTechnology(32, ""), "IB");
  EXPECT_EQ(linkTechnology(774, ""), "FDDI");
  EXPECT_EQ(linkTechnology(784, ""), "FC") << "Fibre Channel has a type for each topology";
  EXPECT_EQ(linkTechnology(787, ""), "FC");
  EXPECT_EQ(linkTechnology(801, ""), "Wireless LAN");
  EXPECT_EQ(linkTechnology(800, ""), "Token Ring");
  EXPECT_EQ(linkTechnology(783, ""), "Infrared");
  EXPECT_EQ(linkTechnology(19, ""), "ATM");
  EXPECT_EQ(linkTechnology(770, ""), "Frame Relay");
  EXPECT_EQ(linkTechnology(15, ""), "Frame Relay");
}

TEST(LinkTechnology, OfWhatLooksLikeAnEthernetIsItsDeviceType) {
  EXPECT_EQ(linkTechnology(1, "DEVTYPE=wlan\nINTERFACE=wlp2s0\n"), "Wireless LAN");
  EXPECT_EQ(linkTechnology(1, "INTERFACE=bnep0\nDEVTYPE=bluetooth"), "BlueTooth");
  EXPECT_EQ(linkTechnology(65534, "DEVTYPE=wwan\n"), "WWAN");
  EXPECT_EQ(linkTechnology(1, "DEVTYPES=wlan\nX_DEVTYPE=wlan\n"), "Ethernet") << "other names";
  EXPECT_EQ(linkTechnology(1, "DEVTYPE"), "Ethernet");
}

TEST(LinkTechnology, WithoutAWordIsAbsent) {
  EXPECT_EQ(linkTechnology(772, ""), std::nullopt) << "loopback";
  EXPECT_EQ(linkTechnology(65534, "DEVTYPE=other\n"), std::nullopt);
}

constexpr std::uint32_t switchedOn = 0x1003;
constexpr std::uint32_t switchedOff = 0x1002;

TEST(PortState, IsThatOfTheLinkWhileItIsSwitchedOn) {
  EXPECT_EQ(portState(switchedOn, "up", true), "up");
  EXPECT_EQ(portState(switchedOn, "testing", std::nullopt), "testing");
  for (const char* word : {"down", "lowerlayerdown", "dormant", "notpresent"}) {
    EXPECT_EQ(portState(switchedOn, word, true), "down") << word;
  }
  EXPECT_EQ(portState(switchedOff, "up", true), "disabled");
  EXPECT_EQ(portState(std::nullopt, "up", std::nullopt), "up") << "without flags the word stands";
}

TEST(PortState, IsTheCarriersWhereTheDriverKnowsNoWord) {
  EXPECT_EQ(portState(switchedOn, "", true), "up");
  EXPECT_EQ(portState(switchedOn, "unknown", false), "down");
  EXPECT_EQ(portState(switchedOn, "unknown", std::nullopt), std::nullopt);
  EXPECT_EQ(portState(std::nullopt, "", std::nullopt), std::nullopt);
}

TEST(AddressText, HasTwoDigitsForAByte) {
  EXPECT_EQ(addressText(std::string_view("\x02\x00\x5e\x10\x00\xff", 6)), "02:00:5e:10:00:ff");
  EXPECT_EQ(addressText(std::string(20, '\x0a'))->size(), 59U) << "InfiniBand has twenty bytes";
}

TEST(AddressText, OfNothingOrZeroesIsAbsent) {
  EXPECT_EQ(addressText(""), std::nullopt);
  EXPECT_EQ(addressText(std::string(6, '\0')), std::nullopt);
}

// What an Ethernet card with a link shows.
constexpr std::string_view oneCard = R"(
sys/devices/pci0000:00/0000:03:00.0/subsystem -> ../../../bus/pci
sys/class/net/eno1/device -> ../../../../sys/devices/pci0000:00/0000:03:00.0
sys/class/net/eno1/dev_port = 0
sys/class/net/eno1/type = 1
sys/class/net/eno1/addr_assign_type = 0
sys/class/net/eno1/address = 02:00:5e:10:00:01
sys/class/net/eno1/operstate = up
sys/class/net/eno1/flags = 0x1003
sys/class/net/eno1/carrier = 1
sys/class/net/eno1/speed = 25000
)";

/// The one port of a machine; its property as a text, "(absent)" where it has none.
std::string portProperty(const NodeTree& tree, int property) {
  const NodeTree::Index port = described(tree, "eno1");
  if (const auto text = tree.text(port, property)) {
    return std::string(*text);
  }
  const auto value = tree.value(port, property);
  return value ? std::to_string(*value) : "(absent)";
}

std::string permanentAddressFrom(const Machine& machine, const std::string& told) {
  const auto ethtool =
      std::make_shared<FakeEthtool>(std::map<std::string, FakeEthtool::Told>{{"eno1", {"", "1", 0, told}}});
  return portProperty(discoverAt(machine, ethtool), PermanentAddressProperty);
}

TEST(PortFacts, StandOnThePort) {
  const NodeTree tree = discoverAt(Machine(oneCard));
  EXPECT_EQ(portProperty(tree, PermanentAddressProperty), "02:00:5e:10:00:01");
  EXPECT_EQ(portProperty(tree, LinkTechnologyProperty), "Ethernet");
  EXPECT_EQ(portProperty(tree, SpeedProperty), "25000");
  EXPECT_EQ(portProperty(tree, StateProperty), "up");
}

TEST(PortFacts, AreAbsentWhereTheKernelShowsNone) {
  Machine machine(oneCard);
  for (const char* attribute :
       {"type", "addr_assign_type", "address", "operstate", "flags", "carrier", "speed"}) {
    machine.remove(std::string("sys/class/net/eno1/") + attribute);
  }
  const NodeTree tree = discoverAt(machine);
  for (const int property :
       {static_cast<int>(PermanentAddressProperty), static_cast<int>(LinkTechnologyProperty),
        static_cast<int>(SpeedProperty), static_cast<int>(StateProperty)}) {
    EXPECT_EQ(portProperty(tree, property), "(absent)") << property;
  }
  EXPECT_FALSE(reportOn(tree, "network", "/speed")) << "older kernels lack it, too";
}

TEST(PortFacts, SpeedThatTheDriverDoesNotKnowIsAbsent) {
  Machine machine(oneCard);
  for (const char* speed : {"-1", "0", "4294967295", "fast"}) {
    machine.add(std::string("sys/class/net/eno1/speed = ") + speed);
    EXPECT_EQ(portProperty(discoverAt(machine), SpeedProperty), "(absent)") << speed;
  }
}

TEST(PortFacts, SpeedOfALinkThatIsGoneIsAbsent) {
  Machine machine(oneCard);
  machine.add("sys/class/net/eno1/operstate = down");
  const NodeTree tree = discoverAt(machine);
  EXPECT_EQ(portProperty(tree, StateProperty), "down");
  EXPECT_EQ(portProperty(tree, SpeedProperty), "(absent)");
}

TEST(PortFacts, AddressThatSomebodySetIsAskedOfTheDriver) {
  Machine machine(oneCard);
  const std::string true6("\x02\x00\x5e\x10\x00\x77", 6);
  EXPECT_EQ(permanentAddressFrom(machine, true6), "02:00:5e:10:00:01") << "nobody set it";
  for (const char* assignment : {"1", "2", "3"}) {  // random, another device's, set
    machine.add(std::string("sys/class/net/eno1/addr_assign_type = ") + assignment);
    EXPECT_EQ(permanentAddressFrom(machine, true6), "02:00:5e:10:00:77");
    EXPECT_EQ(permanentAddressFrom(machine, ""), "(absent)") << "the driver does not tell";
    EXPECT_EQ(permanentAddressFrom(machine, std::string(6, '\0')), "(absent)");
  }
}

TEST(PortFacts, AddressOfZeroesIsNone) {
  Machine machine(oneCard);
  machine.add("sys/class/net/eno1/address = 00:00:00:00:00:00");
  EXPECT_EQ(permanentAddressFrom(machine, ""), "(absent)");
}

TEST(PortFacts, DriverThatFailsToTellItsAddressIsReported) {
  class Failing : public FakeEthtool {
   public:
    Failing() : FakeEthtool({}) {}
    Answer permanentAddress(const std::string& /*interfaceName*/) override { return {EIO, {}}; }
  };
  Machine machine(oneCard);
  machine.add("sys/class/net/eno1/addr_assign_type = 3");
  const NodeTree tree = discoverAt(machine, std::make_shared<Failing>());
  const auto report = reportOn(tree, "network", "permanent address of eno1");
  ASSERT_TRUE(report);
  EXPECT_EQ(report->reason, SourceReport::Reason::Unreadable);
}

TEST(KernelEthtoolTest, AnUnknownInterfaceHasNoAddress) {
  EXPECT_EQ(makeKernelEthtool()->permanentAddress("no-such-if").error, ENODEV);
  EXPECT_EQ(makeKernelEthtool()->permanentAddress("a-name-that-is-too-long").error, ENODEV);
}

TEST(KernelEthtoolTest, TheLoopbackHasNoAddressOfItsOwn) {
  const auto answer = makeKernelEthtool()->permanentAddress("lo");
  EXPECT_TRUE(answer.error != 0 || addressText(answer.bytes) == std::nullopt);
}

TEST(ComputerState, IsKnownOfTheRunningSystemAlone) {
  EXPECT_EQ(discover({}).text(0, StateProperty), "up");
  EXPECT_EQ(discoverAt(Machine(oneCard)).text(0, StateProperty), std::nullopt);
}

}  // namespace
}  // namespace agent::discovery::test
