// The video BIOS of graphics processors.
#include "Machine.h"

#include <gtest/gtest.h>

namespace agent::discovery::test {
namespace {

constexpr std::string_view card = R"(
  sys/class/drm/card0/device -> ../../../devices/pci0000:00/0000:03:00.0
  sys/class/drm/renderD128/device -> ../../../devices/pci0000:00/0000:03:00.0
  sys/class/drm/card0-HDMI-A-1/device/vbios_version = connectors are no cards
  sys/devices/pci0000:00/0000:03:00.0/subsystem -> ../../../bus/pci
)";

TEST(GpuSource, VideoBiosStandsBelowItsGraphicsProcessor) {
  Machine machine(card);
  machine.add("sys/devices/pci0000:00/0000:03:00.0/vbios_version = 113-D0650300-105");
  const NodeTree tree = discoverAt(machine);
  EXPECT_EQ(shown(tree), R"(40 Computer System
  1000 Graphics Processor
    3 Video BIOS 307="113-D0650300-105"
)");
  EXPECT_EQ(tree.position(described(tree, "Graphics Processor")), "0000:03:00.0");
}

TEST(GpuSource, InAVirtualMachineItIsAbsent) {
  Machine machine(card);
  EXPECT_EQ(shown(discoverAt(machine)), "40 Computer System\n");
  for (const char* nothing : {"", "N/A", "00.00.00.00"}) {
    machine.add("sys/devices/pci0000:00/0000:03:00.0/vbios_version = " + std::string(nothing));
    const NodeTree tree = discoverAt(machine);
    EXPECT_EQ(shown(tree), "40 Computer System\n") << nothing;
    EXPECT_FALSE(reportOn(tree, "gpu", ""));
  }
}

}  // namespace
}  // namespace agent::discovery::test
