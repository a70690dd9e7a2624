#include "Machine.h"

#include <agent/discovery/SystemRoot.h>

#include <gtest/gtest.h>

#include <cerrno>
#include <string>

namespace agent::discovery::test {
namespace {

using Known = std::map<std::string, ModuleDatabase::Answer>;

std::shared_ptr<ModuleDatabase> knowing(Known known) {
  return std::make_shared<FakeModules>(std::move(known));
}

/// A device of the PCI bus, bound to a driver.
std::string bound(const std::string& device, const std::string& driver) {
  return "sys/bus/pci/devices/" + device + "/driver -> ../../drivers/" + driver + "\n";
}

std::string ofModule(const std::string& driver, const std::string& module) {
  return "sys/bus/pci/drivers/" + driver + "/module -> ../../../../module/" + module + "\n";
}

constexpr std::string_view kernel = "proc/sys/kernel/osrelease = 6.1.0\n";

std::string drivers(const NodeTree& tree) {
  const std::string text = shown(tree);
  return text.substr(text.find('\n') + 1);
}

TEST(DriverSource, VersionIsSysfsThenTheDatabasesThenTheKernels) {
  Machine machine(kernel);
  machine.add(bound("0", "one") + ofModule("one", "one") + "sys/module/one/version = 1.1");
  machine.add(bound("1", "two") + ofModule("two", "two"));
  machine.add(bound("2", "three") + ofModule("three", "three"));
  machine.add(bound("3", "four") + ofModule("four", "four") + "sys/module/four/version = N/A");
  const NodeTree tree = discoverAt(
      machine, nullptr, knowing({{"one", {0, "9"}}, {"two", {0, " 2.2 "}}, {"four", {0, "none"}}}));
  EXPECT_EQ(drivers(tree), R"(  44 four driver 108="four" 134="6.1.0" 1000="pci:3"
  44 one driver 108="one" 134="1.1" 1000="pci:0"
  44 three driver 108="three" 134="6.1.0" 1000="pci:2"
  44 two driver 108="two" 134="2.2" 1000="pci:1"
)");
  EXPECT_EQ(reportOn(tree, "drivers", ""), std::nullopt);
}

TEST(DriverSource, OnTheRunningSystemModuleFilesAreNotLookedFor) {
  const SystemRoot system("/");
  const std::string release = system.read("proc/sys/kernel/osrelease").value.value_or("\n");
  // On a machine without module files a look for them would be told; with them, nothing may be opened.
  const std::string folder = "/lib/modules/" + release.substr(0, release.find('\n'));
  ASSERT_TRUE(system.list("sys/module")) << "the test needs a system that shows its modules";
  EXPECT_EQ(reportOn(discover(), "drivers", folder), std::nullopt);

  Machine machine(kernel);
  machine.add(bound("0", "one") + ofModule("one", "one") + "sys/module/one/initstate = live\n");
  EXPECT_TRUE(reportOn(discoverAt(machine), "drivers", "/lib/modules/6.1.0"));
}

TEST(DriverSource, DriversOfOneModuleAreOneNode) {
  Machine machine(kernel);
  machine.add(bound("0000:02:00.0", "snd_a") + bound("0000:01:00.0", "snd_b"));
  machine.add(ofModule("snd_a", "snd") + ofModule("snd_b", "snd"));
  machine.add(
      "sys/bus/usb/devices/1-1:1.0/driver -> ../../drivers/snd-usb\n"
      "sys/bus/usb/drivers/snd-usb/module -> ../../../../module/snd\n");
  EXPECT_EQ(drivers(discoverAt(machine, nullptr, knowing({}))),
            "  44 snd driver 108=\"snd\" 134=\"6.1.0\" "
            "1000=\"pci:0000:01:00.0, pci:0000:02:00.0, usb:1-1:1.0\"\n");
}

TEST(DriverSource, ABuiltInDriverIsFoundByItsOwnName) {
  Machine machine(kernel);
  machine.add(bound("0", "virtio-pci") + "sys/module/virtio_pci/version = 1\n");
  machine.add(bound("1", "acpi-ged"));
  EXPECT_EQ(drivers(discoverAt(machine, nullptr, knowing({{"acpi_ged", {0, "3"}}}))),
            "  44 acpi-ged driver 108=\"acpi-ged\" 134=\"3\" 1000=\"pci:1\"\n"
            "  44 virtio_pci driver 108=\"virtio_pci\" 134=\"1\" 1000=\"pci:0\"\n");
}

TEST(DriverSource, NumberOutlivesTheMoveFromKernelToModule) {
  Machine machine(kernel);
  machine.add(bound("0", "virtio-pci"));
  const NodeTree builtIn = discoverAt(machine, nullptr, knowing({}));
  machine.add(ofModule("virtio-pci", "virtio_pci"));
  const NodeTree loaded = discoverAt(machine, nullptr, knowing({}));
  EXPECT_EQ(builtIn.description(1), "virtio-pci driver");
  EXPECT_EQ(loaded.description(1), "virtio_pci driver");
  EXPECT_EQ(builtIn.number(1), loaded.number(1));
}

TEST(DriverSource, ManyDevicesAreCountedBeyondTheLimit) {
  Machine machine(kernel);
  for (int i = 100; i < 300; ++i) {
    machine.add(bound("0000:00:" + std::to_string(i), "hub"));
  }
  const NodeTree tree = discoverAt(machine, nullptr, knowing({}));
  const auto text = tree.text(1, 1000);
  ASSERT_TRUE(text);
  EXPECT_LT(text->size(), 1100U);
  EXPECT_TRUE(text->starts_with("pci:0000:00:100, pci:0000:00:101, ")) << *text;
  EXPECT_TRUE(text->ends_with(" more")) << *text;
}

TEST(DriverSource, DatabaseErrorsAreReportedExceptThatItKnowsNoSuchModule) {
  Machine machine(kernel);
  machine.add(bound("0", "one") + bound("1", "two"));
  const NodeTree tree = discoverAt(machine, nullptr, knowing({{"one", {EACCES, std::nullopt}}}));
  const auto report = reportOn(tree, "drivers", "module information of one");
  ASSERT_TRUE(report);
  EXPECT_EQ(report->reason, SourceReport::Reason::NoPermission);
  EXPECT_FALSE(reportOn(tree, "drivers", "module information of two"));
  EXPECT_EQ(tree.text(1, Oru::NodeLexicon::DriverVersionProperty), "6.1.0");
}

TEST(DriverSource, WithoutAReleaseTheVersionIsAbsent) {
  const Machine machine(bound("0", "one"));
  const NodeTree tree = discoverAt(machine);
  EXPECT_EQ(drivers(tree), "  44 one driver 108=\"one\" 1000=\"pci:0\"\n");
  EXPECT_TRUE(reportOn(tree, "drivers", "osrelease"));
}

TEST(DriverSource, ReportsAreBoundedAndCounted) {
  Machine machine(kernel);
  Known broken;
  for (int i = 0; i < 200; ++i) {
    const std::string name = "driver" + std::to_string(i);
    machine.add(bound(std::to_string(i), name));
    broken[name] = {EIO, std::nullopt};
  }
  const NodeTree tree = discoverAt(machine, nullptr, knowing(broken));
  std::size_t count = 0;
  std::string last;
  for (const SourceReport& report : tree.reports()) {
    if (report.source == "drivers") {
      ++count;
      last = report.detail;
    }
  }
  EXPECT_EQ(count, 65U);
  EXPECT_EQ(last, "136 more that could not be read");
}

TEST(DriverSource, AnOddDriverEntryIsReported) {
  const Machine machine("sys/bus/pci/devices/0/driver = a file");
  const auto report = reportOn(discoverAt(machine), "drivers", "sys/bus/pci/devices/0/driver");
  ASSERT_TRUE(report);
  EXPECT_EQ(report->reason, SourceReport::Reason::Unreadable);
}

}  // namespace
}  // namespace agent::discovery::test
