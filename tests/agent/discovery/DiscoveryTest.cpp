// Whole machines, as they are met.
#include "Captures.h"

#include <gtest/gtest.h>

namespace agent::discovery::test {
namespace {

TEST(Discovery, ServerShowsFirmwareDevicesPortsAndDrivers) {
  const Machine machine(server);
  EXPECT_EQ(shown(discoverAt(machine, serverEthtool(),
                             std::make_shared<FakeModules>(std::map<std::string, ModuleDatabase::Answer>{
                                 {"twinport_core", {0, "5.0-0"}}}))),
            R"tree(40 Computer System 108="rack7-node3"
  3 BIOS 36="Corvane Ltd." 104=5 107=17 164="03/09/2023" 307="U41 v2.66"
  49 Network Device 134="5.6.0-k"
    3 Network Firmware 307="1.61, 0x80000d62, 1.2527.0"
    12 eno2 108="0000:02:00.1/1"
  49 Network Device 134="6.1.0-18-amd64"
    3 Network Firmware 307="16.32.1010 (MT_0000000012)"
    12 ens1 108="0000:3b:00.0/1"
    12 ens1d1 108="0000:3b:00.0/2"
  49 Network Device 134="5.6.0-k"
    12 eno1 108="0000:02:00.0/1"
  49 Network Device
    12 usb0 108="usb:1-4:1.0/1"
  44 cdc_ether driver 108="cdc_ether" 134="6.1.0-18-amd64" 1000="usb:1-4:1.0"
  44 gig driver 108="gig" 134="5.6.0-k" 1000="pci:0000:02:00.0, pci:0000:02:00.1"
  44 pcieport driver 108="pcieport" 134="6.1.0-18-amd64" 1000="pci:0000:3a:00.0"
  44 twinport_core driver 108="twinport_core" 134="5.0-0" 1000="pci:0000:3b:00.0"
)tree");
}

TEST(Discovery, ServerReportsWhatSomeDriversDoNotTell) {
  const Machine machine(server);
  const NodeTree tree = discoverAt(machine, serverEthtool());
  const auto noFirmware = reportOn(tree, "network", "driver info of eno1");
  ASSERT_TRUE(noFirmware);
  EXPECT_EQ(noFirmware->reason, SourceReport::Reason::Absent);
  const auto noInfo = reportOn(tree, "network", "driver info of usb0");
  ASSERT_TRUE(noInfo);
  EXPECT_EQ(noInfo->reason, SourceReport::Reason::Absent);
  EXPECT_TRUE(reportOn(tree, "dmi", "/sys/firmware/dmi/tables"));
  EXPECT_EQ(tree.reports().size(), 3U);
}

TEST(Discovery, VirtualMachineShowsWhatItHas) {
  const Machine machine(virtualMachine);
  const NodeTree tree = discoverAt(
      machine,
      std::make_shared<FakeEthtool>(std::map<std::string, FakeEthtool::Told>{{"eth0", {"1.0.0", "", 0}}}));
  EXPECT_EQ(shown(tree), R"(40 Computer System 108="vm"
  49 Network Device 134="1.0.0"
    12 eth0 108="0000:00:03.0/1"
  44 serial8250 driver 108="serial8250" 134="6.18.44" 1000="platform:serial8250"
  44 virtio_net driver 108="virtio_net" 134="6.18.44" 1000="virtio:virtio2"
  44 virtio_pci driver 108="virtio_pci" 134="1" 1000="pci:0000:00:03.0"
)");
  const auto noDmi = reportOn(tree, "dmi", "/sys/class/dmi/id");
  ASSERT_TRUE(noDmi);
  EXPECT_EQ(noDmi->reason, SourceReport::Reason::Absent);
  EXPECT_EQ(noDmi->detail, "No such file or directory");
  EXPECT_EQ(noDmi->path, machine.root().string() + "/sys/class/dmi/id");
  const auto noModules = reportOn(tree, "drivers", "/lib/modules/6.18.44");
  ASSERT_TRUE(noModules);
  EXPECT_EQ(noModules->reason, SourceReport::Reason::Absent);
}

TEST(Discovery, MachineWithNothingIsAComputerWithReportsOfEachSource) {
  const Machine machine("");
  const NodeTree tree = discoverAt(machine);
  EXPECT_EQ(shown(tree), "40 Computer System\n");
  EXPECT_EQ(tree.number(0), computerNumber);
  EXPECT_EQ(tree.position(0), computerPosition);
  EXPECT_TRUE(reportOn(tree, "host", "/proc/sys/kernel/hostname"));
  EXPECT_TRUE(reportOn(tree, "dmi", "/sys/class/dmi/id"));
  EXPECT_TRUE(reportOn(tree, "network", "/sys/class/net"));
  EXPECT_TRUE(reportOn(tree, "drivers", "/sys/bus"));
  for (const SourceReport& report : tree.reports()) {
    EXPECT_EQ(report.reason, SourceReport::Reason::Absent) << report.path;
  }
}

TEST(Discovery, AnotherRootAsksNoIoctlAndSaysSo) {
  const Machine machine(server);
  const NodeTree tree = discoverAt(machine);
  EXPECT_EQ(described(tree, "Network Firmware"), NodeTree::none);
  EXPECT_NE(described(tree, "ens1d1"), NodeTree::none);
  const auto report = reportOn(tree, "network", "ethtool driver info");
  ASSERT_TRUE(report);
  EXPECT_EQ(report->reason, SourceReport::Reason::Absent);
}

TEST(Discovery, HostNameIsCleanedAndAPlaceholderIsAbsent) {
  const Machine machine("proc/sys/kernel/hostname =  n\tode\xff ");
  EXPECT_EQ(shown(discoverAt(machine)), "40 Computer System 108=\"n ode\xEF\xBF\xBD\"\n");
  const Machine unnamed("proc/sys/kernel/hostname = (none)");
  const NodeTree tree = discoverAt(unnamed);
  EXPECT_EQ(shown(tree), "40 Computer System\n");
  const auto report = reportOn(tree, "host", "hostname");
  ASSERT_TRUE(report);
  EXPECT_EQ(report->detail, "it says nothing: \"(none)\"");
}

TEST(Discovery, LiveMachineHasANamedComputer) {
  const NodeTree tree = discover();
  ASSERT_GE(tree.size(), 1U);
  EXPECT_EQ(tree.type(0), Oru::NodeLexicon::ComputerSystemNode);
  EXPECT_TRUE(tree.text(0, Oru::NodeLexicon::NameProperty));
}

}  // namespace
}  // namespace agent::discovery::test
