#include "Machine.h"

#include <agent/discovery/BusAddress.h>
#include <agent/discovery/network/Interfaces.h>

#include <gtest/gtest.h>

#include <algorithm>
#include <cerrno>

namespace agent::discovery::test {
namespace {

using Told = std::map<std::string, FakeEthtool::Told>;

std::shared_ptr<Ethtool> telling(Told told) {
  return std::make_shared<FakeEthtool>(std::move(told));
}

/// The lines of an interface `name` below a device folder.
std::string interfaceLines(const std::string& name, const std::string& device,
                           const std::string& attributes) {
  std::string lines = "sys/class/net/" + name + "/device -> ../../../../" + device + "\n";
  std::string_view rest = attributes;
  while (!rest.empty()) {
    const std::size_t end = std::min(rest.find(';'), rest.size());
    lines += "sys/class/net/" + name + "/" + std::string(rest.substr(0, end)) + "\n";
    rest.remove_prefix(std::min(end + 1, rest.size()));
  }
  return lines;
}

constexpr std::string_view pciFunction =
    "sys/devices/pci0000:00/0000:03:00.0/subsystem -> ../../../bus/pci\n";
const std::string pciDevice = "sys/devices/pci0000:00/0000:03:00.0";

TEST(DriverInfoBytes, AreReadByField) {
  const auto info = parseDriverInfo(driverInfoBytes("5.6.0-k", "1.61, 0x80000d62"));
  ASSERT_TRUE(info);
  EXPECT_EQ(info->driverVersion, "5.6.0-k");
  EXPECT_EQ(info->firmwareVersion, "1.61, 0x80000d62");
}

TEST(DriverInfoBytes, FieldWithoutAnEndStopsAtItsWidth) {
  const std::string full(64, 'f');  // more than a field holds
  const auto info = parseDriverInfo(driverInfoBytes(full, full));
  ASSERT_TRUE(info);
  EXPECT_EQ(info->driverVersion, std::string(32, 'f'));
  EXPECT_EQ(info->firmwareVersion, std::string(32, 'f'));
}

TEST(DriverInfoBytes, StandInsAreAbsent) {
  for (const char* text : {"", "N/A", "n/a", "  ", "To be filled by O.E.M."}) {
    EXPECT_EQ(parseDriverInfo(driverInfoBytes("1", text))->firmwareVersion, std::nullopt) << text;
  }
}

TEST(DriverInfoBytes, TooFewAreNone) {
  const std::string bytes = driverInfoBytes("1", "2");
  EXPECT_TRUE(parseDriverInfo(bytes));
  EXPECT_FALSE(parseDriverInfo(std::string_view(bytes).substr(0, bytes.size() - 1)));
  EXPECT_FALSE(parseDriverInfo(""));
}

TEST(PortNumber, CountsFromOne) {
  EXPECT_EQ(portNumber(0, 0), 1U);
  EXPECT_EQ(portNumber(1, 0), 2U);
  EXPECT_EQ(portNumber(std::nullopt, std::nullopt), 1U);
  EXPECT_EQ(portNumber(0, 1), 2U) << "old drivers count in dev_id";
  EXPECT_EQ(portNumber(2, 7), 3U);
}

TEST(PciAddress, HasDomainBusSlotAndFunction) {
  for (const char* text : {"0000:3b:00.0", "10000:e1:1f.7", "abcd:00:00.1"}) {
    EXPECT_TRUE(isPciAddress(text)) << text;
  }
  for (const char* text :
       {"", "3b:00.0", "0000:3b:00.8", "0000:3b:00", "0000:3b:00.0/", "pci0000:00", "virtio2", "0000:3B:00.0",
        "000000000:3b:00.0", "0000:", "0000-3b:00.0", "0000:3b.00.0"}) {
    EXPECT_FALSE(isPciAddress(text)) << text;
  }
}

TEST(NetworkSource, OneFirmwareForAllPortsOfAFunction) {
  Machine machine(pciFunction);
  machine.add(interfaceLines("b", pciDevice, "dev_port = 0") +
              interfaceLines("a", pciDevice, "dev_port = 1"));
  const NodeTree tree = discoverAt(machine, telling({{"a", {"", "9.1", 0}}, {"b", {"", "N/A", 0}}}));
  EXPECT_EQ(shown(tree), R"(40 Computer System
  49 Network Device
    3 Network Firmware 307="9.1"
    12 b 108="0000:03:00.0/1"
    12 a 108="0000:03:00.0/2"
)");
}

TEST(NetworkSource, DevicesWithFirmwareComeFirstThenByAddress) {
  Machine machine("");
  for (const char* slot : {"4", "1", "3", "2"}) {
    const std::string device = "sys/devices/pci0000:00/0000:0" + std::string(slot) + ":00.0";
    machine.add(device + "/subsystem -> ../../../bus/pci\n" +
                interfaceLines("e" + std::string(slot), device, ""));
  }
  const NodeTree tree = discoverAt(
      machine,
      telling(
          {{"e1", {"", "", 0}}, {"e2", {"", "2.2", 0}}, {"e3", {"", "", EPERM}}, {"e4", {"", "4.4", 0}}}));
  std::vector<std::string> positions;
  for (const NodeTree::Index device : tree.ofType(Oru::NodeLexicon::NetworkDeviceNode)) {
    positions.emplace_back(tree.position(device));
  }
  EXPECT_EQ(positions,
            (std::vector<std::string>{"0000:02:00.0", "0000:04:00.0", "0000:01:00.0", "0000:03:00.0"}));
}

TEST(NetworkSource, FailedQuestionsAreReportedWithTheSystemsReason) {
  Machine machine(pciFunction);
  machine.add(interfaceLines("e0", pciDevice, "dev_port = 0") +
              interfaceLines("e1", pciDevice, "dev_port = 1"));
  const NodeTree tree = discoverAt(machine, telling({{"e0", {"", "", EPERM}}, {"e1", {"", "", EIO}}}));
  const auto refused = reportOn(tree, "network", "driver info of e0");
  ASSERT_TRUE(refused);
  EXPECT_EQ(refused->reason, SourceReport::Reason::NoPermission);
  EXPECT_EQ(refused->detail, "Operation not permitted");
  const auto broken = reportOn(tree, "network", "driver info of e1");
  ASSERT_TRUE(broken);
  EXPECT_EQ(broken->reason, SourceReport::Reason::Unreadable);
  EXPECT_EQ(broken->detail, "Input/output error");
  EXPECT_EQ(tree.ofType(Oru::NodeLexicon::NetworkPortNode).size(), 2U);
}

TEST(NetworkSource, RepresentorsBearTheirFunction) {
  Machine machine(pciFunction);
  machine.add(interfaceLines("up", pciDevice, "ifindex = 9;phys_port_name = p0") +
              interfaceLines("r1", pciDevice, "ifindex = 3;phys_port_name = pf0vf1") +
              interfaceLines("r0", pciDevice, "ifindex = 2;phys_port_name = c1pf0vf0"));
  EXPECT_EQ(shown(discoverAt(machine, telling({}))), R"(40 Computer System
  49 Network Device
    12 r0 108="0000:03:00.0/1.c1pf0vf0"
    12 up 108="0000:03:00.0/1"
    12 r1 108="0000:03:00.0/1.pf0vf1"
)");
}

TEST(NetworkSource, InterfacesOfOnePortAreToldApartByAge) {
  Machine machine(pciFunction);
  machine.add(interfaceLines("wlan0", pciDevice, "ifindex = 3") +
              interfaceLines("ap0", pciDevice, "ifindex = 10"));
  EXPECT_EQ(shown(discoverAt(machine, telling({}))), R"(40 Computer System
  49 Network Device
    12 wlan0 108="0000:03:00.0/1"
    12 ap0 108="0000:03:00.0/1.2"
)");
}

TEST(NetworkSource, InterfacesOfOnePortKeepTheirIdentitiesInAnotherProbeOrder) {
  const std::string firstAddress = "address = 02:00:5e:10:00:01;";
  const std::string secondAddress = "address = 02:00:5e:10:00:02;";
  for (const auto& [firstIndex, secondIndex] :
       {std::pair("ifindex = 3", "ifindex = 10"), std::pair("ifindex = 10", "ifindex = 3")}) {
    Machine machine(pciFunction);
    machine.add(interfaceLines("wlan0", pciDevice, firstAddress + firstIndex) +
                interfaceLines("ap0", pciDevice, secondAddress + secondIndex));
    EXPECT_EQ(shown(discoverAt(machine, telling({}))), R"(40 Computer System
  49 Network Device
    12 wlan0 108="0000:03:00.0/1"
    12 ap0 108="0000:03:00.0/1.2"
)") << firstIndex;
  }
}

TEST(NetworkSource, InterfacesOfOnePortAndAddressAreToldApartByAge) {
  const std::string address = "address = 02:00:5e:10:00:01;";
  Machine machine(pciFunction);
  machine.add(interfaceLines("wlan0", pciDevice, address + "ifindex = 3") +
              interfaceLines("ap0", pciDevice, address + "ifindex = 10"));
  EXPECT_EQ(shown(discoverAt(machine, telling({}))), R"(40 Computer System
  49 Network Device
    12 wlan0 108="0000:03:00.0/1"
    12 ap0 108="0000:03:00.0/1.2"
)");
}

TEST(NetworkSource, PartsOfAFunctionBelongToTheFunction) {
  Machine machine(R"(
    sys/devices/platform/LNRO0005:00/subsystem -> ../../../bus/platform
    sys/devices/platform/LNRO0005:00/virtio0/subsystem -> ../../../../bus/virtio
    sys/devices/pci0000:00/0000:03:00.0/subsystem -> ../../../bus/pci
    sys/devices/pci0000:00/0000:03:00.0/part.sf.4/subsystem -> ../../../../bus/auxiliary
    sys/devices/pci0000:00/0000:05:00.0/virtio9/
  )");
  machine.add(interfaceLines("mmio", "sys/devices/platform/LNRO0005:00/virtio0", "") +
              interfaceLines("share", pciDevice + "/part.sf.4", "") +
              interfaceLines("bare", "sys/devices/pci0000:00/0000:05:00.0/virtio9", ""));
  EXPECT_EQ(shown(discoverAt(machine, telling({}))), R"(40 Computer System
  49 Network Device
    12 share 108="0000:03:00.0/1"
  49 Network Device
    12 bare 108="0000:05:00.0/1"
  49 Network Device
    12 mmio 108="platform:LNRO0005:00/1"
)");
}

TEST(NetworkSource, ADeviceOnNoBusStandsForItself) {
  Machine machine("sys/devices/virtual/radio/sim0/subsystem -> ../../../../class/radio");
  machine.add(interfaceLines("sim", "sys/devices/virtual/radio/sim0", ""));
  EXPECT_NE(shown(discoverAt(machine, telling({}))).find("12 sim 108=\"device:sim0/1\""), std::string::npos);
}

TEST(NetworkSource, AnUnreadableDeviceLinkIsReported) {
  const Machine machine("sys/class/net/odd/device -> device");
  const NodeTree tree = discoverAt(machine, telling({}));
  const auto report = reportOn(tree, "network", "sys/class/net/odd/device");
  ASSERT_TRUE(report);
  EXPECT_EQ(report->reason, SourceReport::Reason::Unreadable);
}

TEST(NetworkSource, AnOddPortNumberIsReportedAndCountsAsTheFirst) {
  Machine machine(pciFunction);
  machine.add(interfaceLines("e0", pciDevice, "dev_port = 65536"));
  const NodeTree tree = discoverAt(machine, telling({}));
  EXPECT_EQ(tree.text(described(tree, "e0"), Oru::NodeLexicon::NameProperty), "0000:03:00.0/1");
  const auto report = reportOn(tree, "network", "e0/dev_port");
  ASSERT_TRUE(report);
  EXPECT_EQ(report->reason, SourceReport::Reason::Unreadable);
  EXPECT_EQ(report->detail, "\"65536\" is no number up to 65535");
}

TEST(KernelEthtoolTest, AnUnknownInterfaceIsNoDevice) {
  const auto ethtool = makeKernelEthtool();
  EXPECT_EQ(ethtool->driverInfo("no-such-if").error, ENODEV);
  EXPECT_EQ(ethtool->driverInfo(std::string(300, 'x')).error, ENODEV);
}

}  // namespace
}  // namespace agent::discovery::test
