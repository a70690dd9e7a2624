// Network devices of odd machines: functions shared and virtual, InfiniBand, and what is no device.
#include "DevlinkBytes.h"
#include "Machine.h"

#include <agent/discovery/network/Infiniband.h>

#include <gtest/gtest.h>

#include <cerrno>

namespace agent::discovery::test {
namespace {

using Told = std::map<std::string, FakeEthtool::Told>;

NodeTree discovered(const Machine& machine, Told ethtool, NetlinkOpener netlink) {
  DiscoveryOptions options;
  options.root = machine.root();
  options.deadline = std::chrono::seconds(60);  // a loaded test machine is no reason to miss a node
  options.ethtool = std::make_shared<FakeEthtool>(std::move(ethtool));
  options.netlink = std::move(netlink);
  return discover(options);
}

/// A physical function, its virtual function, and an interface of each.
constexpr std::string_view functions = R"(
  sys/devices/pci0000:00/0000:03:00.0/subsystem -> ../../../bus/pci
  sys/devices/pci0000:00/0000:03:02.0/subsystem -> ../../../bus/pci
  sys/devices/pci0000:00/0000:03:02.0/physfn -> ../0000:03:00.0
  sys/bus/pci/devices/0000:03:00.0 -> ../../../devices/pci0000:00/0000:03:00.0
  sys/bus/pci/devices/0000:03:02.0 -> ../../../devices/pci0000:00/0000:03:02.0
  sys/class/net/e0/device -> ../../../devices/pci0000:00/0000:03:00.0
  sys/class/net/e0v0/device -> ../../../devices/pci0000:00/0000:03:02.0
)";

TEST(NetworkMachine, VirtualFunctionHasAPortAndNoFirmwareOfItsOwn) {
  const Machine machine(functions);
  const NodeTree tree = discovered(machine, {{"e0", {"5.1", "9.2", 0}}, {"e0v0", {"4.0", "9.2", 0}}},
                                   devlinkTelling({{"pci/0000:03:00.0", {"running fw=9.2", 0}},
                                                   {"pci/0000:03:02.0", {"running fw=9.2", 0}}}));
  EXPECT_EQ(shown(tree), R"(40 Computer System
  49 Network Device 134="5.1"
    3 Network Firmware 307="9.2"
    12 e0 108="0000:03:00.0/1"
  49 Network Device 134="4.0"
    12 e0v0 108="0000:03:02.0/1"
)");
}

TEST(NetworkMachine, VirtualFunctionWithoutAVersionIsNothingToReport) {
  const Machine machine(functions);
  const NodeTree tree = discovered(machine, {{"e0", {"5.1", "9.2", 0}}, {"e0v0", {"4.0", "N/A", 0}}},
                                   devlinkTelling({{"pci/0000:03:02.0", {"", EIO}}}));
  EXPECT_FALSE(reportOn(tree, "network", "driver info of e0v0"));
  EXPECT_FALSE(reportOn(tree, "network", "0000:03:02.0")) << "and it is not asked";
}

TEST(NetworkMachine, PortsBehindAVirtioNodeBelongToThePciFunction) {
  const Machine machine(R"(
    sys/devices/pci0000:00/0000:00:03.0/subsystem -> ../../../bus/pci
    sys/devices/pci0000:00/0000:00:03.0/virtio1/subsystem -> ../../../../bus/virtio
    sys/class/net/eth0/device -> ../../../devices/pci0000:00/0000:00:03.0/virtio1
  )");
  const NodeTree tree = discovered(machine, {{"eth0", {"1.0.0", "", 0}}}, nullptr);
  EXPECT_EQ(shown(tree), R"(40 Computer System
  49 Network Device 134="1.0.0"
    12 eth0 108="0000:00:03.0/1"
)");
}

TEST(NetworkMachine, BridgesVlansBondsAndTheLoopbackAreNoDevices) {
  const Machine machine(R"(
    sys/class/net/bonding_masters = bond0
    sys/class/net/bond0 -> ../../devices/virtual/net/bond0
    sys/devices/virtual/net/bond0/address = 02:00:5e:10:00:01
    sys/class/net/br0 -> ../../devices/virtual/net/br0
    sys/devices/virtual/net/br0/address = 02:00:5e:10:00:01
    sys/class/net/e0.42 -> ../../devices/virtual/net/e0.42
    sys/devices/virtual/net/e0.42/address = 02:00:5e:10:00:01
    sys/class/net/lo -> ../../devices/virtual/net/lo
    sys/devices/virtual/net/lo/address = 00:00:00:00:00:00
  )");
  const NodeTree tree = discovered(machine, {}, devlinkTelling({}));
  EXPECT_EQ(shown(tree), "40 Computer System\n");
  EXPECT_FALSE(reportOn(tree, "network", ""));
}

TEST(NetworkMachine, TheDriversVersionAndTheModulesCanDiffer) {
  Machine machine(functions);
  machine.add(R"(
    sys/devices/pci0000:00/0000:03:00.0/driver -> ../../../bus/pci/drivers/gig
    sys/bus/pci/drivers/gig/module -> ../../../../module/gig
    sys/module/gig/initstate = live
    sys/module/gig/version = 5.6.0-k
  )");
  const NodeTree tree = discovered(machine, {{"e0", {"6.1.0-18-amd64", "9.2", 0}}}, nullptr);
  EXPECT_EQ(tree.text(described(tree, "Network Device"), Oru::NodeLexicon::DriverVersionProperty),
            "6.1.0-18-amd64");
  EXPECT_EQ(tree.text(described(tree, "gig driver"), Oru::NodeLexicon::DriverVersionProperty), "5.6.0-k");
}

TEST(NetworkMachine, DevlinkIsAskedOncePerDeviceHoweverManyPortsItHas) {
  Machine machine(functions);
  machine.add(R"(
    sys/class/net/e0/dev_port = 0
    sys/class/net/e1/device -> ../../../devices/pci0000:00/0000:03:00.0
    sys/class/net/e1/dev_port = 1
  )");
  machine.remove("sys/class/net/e0v0");
  const NodeTree tree = discovered(
      machine, {{"e0", {"", "1.0", 0}}, {"e1", {"", "1.0", 0}}},
      devlinkTelling(
          {{"pci/0000:03:00.0", {"fixed board.id=K9;running fw.undi=2.0;stored fw.undi=2.1", 0}}}));
  EXPECT_EQ(shown(tree), R"(40 Computer System
  49 Network Device 1011="board.id=K9"
    3 Network Firmware 307="1.0"
    3 Network Option ROM 108="fw.undi" 307="2.0" 1010="2.1"
    12 e0 108="0000:03:00.0/1"
    12 e1 108="0000:03:00.0/2"
)");
}

TEST(NetworkMachine, DevicesOfOtherBusesAreAskedByTheirBus) {
  const Machine machine(R"(
    sys/devices/chip1/subsystem -> ../../bus/chips
    sys/class/net/e0/device -> ../../../devices/chip1
    sys/devices/virtual/radio/sim0/subsystem -> ../../../../class/radio
    sys/class/net/sim/device -> ../../../devices/virtual/radio/sim0
  )");
  const NodeTree tree = discovered(
      machine, {{"e0", {"", "", EOPNOTSUPP}}, {"sim", {"", "", EOPNOTSUPP}}},
      devlinkTelling({{"chips/chip1", {"running fw.mgmt=1.2", 0}}, {"device/sim0", {"running fw=1", 0}}}));
  EXPECT_EQ(shown(tree), R"(40 Computer System
  49 Network Device
    3 Network Control Firmware 108="fw.mgmt" 307="1.2"
    12 e0 108="chips:chip1/1"
  49 Network Device
    12 sim 108="device:sim0/1"
)");
}

struct DevlinkFailure {
  int error;
  SourceReport::Reason reason;
  std::string path;
  std::string detail;
};

TEST(NetworkMachine, WhatDevlinkDoesNotAnswerIsReported) {
  const std::string device = "devlink info of pci/0000:03:00.0";
  for (const DevlinkFailure& failure : std::vector<DevlinkFailure>{
           {EOPNOTSUPP, SourceReport::Reason::Absent, device, "the driver does not tell"},
           {EPERM, SourceReport::Reason::NoPermission, device, "Operation not permitted"},
           {EIO, SourceReport::Reason::Unreadable, device, "Input/output error"},
           {ENOENT, SourceReport::Reason::Absent, "devlink info", "the kernel has no devlink"},
           {ETIMEDOUT, SourceReport::Reason::TimedOut, device,
            "no answer in 1000 ms; devlink is not asked about further devices"}}) {
    const Machine machine(functions);
    const NodeTree tree = discovered(machine, {{"e0", {"", "9.2", 0}}},
                                     devlinkTelling({{"pci/0000:03:00.0", {"", failure.error}}}));
    const auto report = reportOn(tree, "network", failure.path);
    ASSERT_TRUE(report) << failure.error;
    EXPECT_EQ(report->reason, failure.reason) << failure.error;
    EXPECT_EQ(report->detail, failure.detail);
    EXPECT_EQ(tree.text(described(tree, "Network Firmware"), Oru::NodeLexicon::VersionStringProperty), "9.2")
        << "what was answered before stands";
  }
}

TEST(NetworkMachine, AfterAnAnswerThatDoesNotComeDevlinkIsNotAskedAgain) {
  for (const int error : {ETIMEDOUT, EIO}) {
    Machine machine(functions);
    machine.remove("sys/devices/pci0000:00/0000:03:02.0/physfn");
    const NodeTree tree = discovered(
        machine, {},
        devlinkTelling({{"pci/0000:03:00.0", {"", error}}, {"pci/0000:03:02.0", {"running fw=1.2", 0}}}));
    EXPECT_EQ(described(tree, "Network Firmware") == NodeTree::none, error == ETIMEDOUT);
  }
}

TEST(NetworkMachine, AnotherRootIsNotAskedByDevlinkAndSaysSo) {
  const Machine machine(functions);
  const auto report = reportOn(discoverAt(machine), "network", "devlink info");
  ASSERT_TRUE(report);
  EXPECT_EQ(report->reason, SourceReport::Reason::Absent);
}

TEST(NetworkMachine, ADeviceThatIsNoneOfDevlinkIsNothingToReport) {
  const Machine machine(functions);
  EXPECT_FALSE(reportOn(discovered(machine, {}, devlinkTelling({})), "network", "0000:03:00.0"));
}

TEST(NetworkMachine, ASocketThatCannotBeOpenedIsReported) {
  const Machine machine(functions);
  const NodeTree tree = discovered(machine, {}, [] { return OpenedNetlink{nullptr, EPROTONOSUPPORT}; });
  const auto report = reportOn(tree, "network", "devlink info");
  ASSERT_TRUE(report);
  EXPECT_EQ(report->detail, "Protocol not supported");
}

constexpr std::string_view infiniband = R"(
  sys/devices/pci0000:00/0000:5e:00.0/subsystem -> ../../../bus/pci
  sys/class/infiniband/hca0/device -> ../../../devices/pci0000:00/0000:5e:00.0
  sys/class/infiniband/hca0/fw_ver = 20.31.1014
  sys/class/infiniband/hca0/ports/1/link_layer = InfiniBand
  sys/class/infiniband/hca0/ports/1/state = 4: ACTIVE
  sys/class/infiniband/hca0/ports/2/link_layer = Ethernet
  sys/class/infiniband/hca0/ports/2/state = 1: DOWN
  sys/class/infiniband/soft0/fw_ver = 1.0
  sys/class/infiniband/soft0/ports/1/state = 4: ACTIVE
)";

TEST(NetworkMachine, InfinibandAdapterWithoutInterfacesIsADeviceWithItsPorts) {
  const Machine machine(infiniband);
  EXPECT_EQ(shown(discovered(machine, {}, devlinkTelling({}))), R"(40 Computer System
  49 Network Device
    3 Network Firmware 307="20.31.1014"
    12 hca0/1 108="0000:5e:00.0/1" 1002="IB" 1004="up"
    12 hca0/2 108="0000:5e:00.0/2" 1002="Ethernet" 1004="down"
)");
}

TEST(NetworkMachine, InfinibandPortsKeepTheirIdentitiesWhenInterfacesCome) {
  Machine machine(infiniband);
  machine.add(R"(
    sys/class/net/ib0/device -> ../../../devices/pci0000:00/0000:5e:00.0
    sys/class/net/ib0/dev_port = 0
    sys/class/net/ib0/type = 32
    sys/class/net/ib1/device -> ../../../devices/pci0000:00/0000:5e:00.0
    sys/class/net/ib1/dev_port = 1
  )");
  const NodeTree tree = discovered(
      machine, {{"ib0", {"", "20.31.1014 (XX_0000000223)", 0}}, {"ib1", {"", "", 0}}}, devlinkTelling({}));
  EXPECT_EQ(shown(tree), R"tree(40 Computer System
  49 Network Device
    3 Network Firmware 307="20.31.1014 (XX_0000000223)"
    12 ib0 108="0000:5e:00.0/1" 1002="IB"
    12 ib1 108="0000:5e:00.0/2"
)tree");
}

TEST(NetworkMachine, InfinibandPortsAreNotAskedByNamesOfInterfaces) {
  const Machine machine(infiniband);
  const NodeTree tree = discovered(machine, {}, devlinkTelling({}));
  EXPECT_FALSE(reportOn(tree, "network", "hca0/1")) << "an unknown interface would be reported";
}

TEST(NetworkMachine, InfinibandVersionOfZeroesIsAbsent) {
  Machine machine(infiniband);
  machine.add("sys/class/infiniband/hca0/fw_ver = 0.0.0");
  EXPECT_EQ(described(discovered(machine, {}, devlinkTelling({})), "Network Firmware"), NodeTree::none);
}

TEST(NetworkMachine, InfinibandAdapterWithoutPortsIsNoDevice) {
  Machine machine(infiniband);
  machine.remove("sys/class/infiniband/hca0/ports");
  EXPECT_EQ(shown(discovered(machine, {}, devlinkTelling({}))), "40 Computer System\n");
}

TEST(InfinibandPortState, IsThatOfTheLogicalPort) {
  EXPECT_EQ(infinibandPortState("4: ACTIVE"), "up");
  EXPECT_EQ(infinibandPortState("5: ACTIVE_DEFER"), "up");
  for (const char* text : {"0: NOP", "1: DOWN", "2: INIT", "3: ARMED"}) {
    EXPECT_EQ(infinibandPortState(text), "down") << text;
  }
  for (const char* text : {"", "4", "ACTIVE", "9: <unknown>", "4: "}) {
    EXPECT_EQ(infinibandPortState(text), std::nullopt) << text;
  }
}

}  // namespace
}  // namespace agent::discovery::test
