// The management engine in the chipset.
#include "Machine.h"

#include <agent/discovery/engine/EngineVersions.h>

#include <gtest/gtest.h>

namespace agent::discovery::test {
namespace {

TEST(EngineVersionLines, AVersionIsWhatFollowsThePlatform) {
  const auto versions = parseEngineVersions("0:11.8.50.3425\n0:11.8.50.3425\n0:11.8.50.1448\n");
  ASSERT_EQ(versions.size(), 2U) << "a part that repeats a version tells nothing new";
  EXPECT_EQ(versions[0].text, "11.8.50.3425");
  EXPECT_EQ(versions[0].major, 11U);
  EXPECT_EQ(versions[0].minor, 8U);
  EXPECT_EQ(versions[1].text, "11.8.50.1448");
}

TEST(EngineVersionLines, OtherFormsAndZerosAreLeftOut) {
  for (const char* text : {"", "\n", "11.8.50.3425", "0:11.8.50", "0:11.8.50.3425.1", "0:11.8.50.x",
                           ":1.2.3.4", "0:0.0.0.0", "0:1.2.3.4294967296", "0 :1.2.3.4", "0:1.2.3.4 "}) {
    EXPECT_TRUE(parseEngineVersions(text).empty()) << text;
  }
  EXPECT_EQ(parseEngineVersions("junk\n1:2.0.0.1").size(), 1U);
}

constexpr std::string_view engine = R"(
  sys/class/mei/mei0 -> ../../devices/pci0000:00/0000:00:16.0/mei/mei0
  sys/devices/pci0000:00/0000:00:16.0/subsystem -> ../../../bus/pci
)";

TEST(EngineSource, EachDistinctVersionIsFirmwareOfTheEngine) {
  Machine machine(engine);
  machine.write("sys/devices/pci0000:00/0000:00:16.0/mei/mei0/fw_ver",
                "0:16.1.25.2049\n0:16.1.25.2049\n0:16.1.25.1900\n");
  const NodeTree tree = discoverAt(machine);
  EXPECT_EQ(shown(tree), R"(40 Computer System
  1000 Management Engine
    3 Management Engine Firmware 104=16 107=1 307="16.1.25.2049"
    3 Management Engine Firmware 104=16 107=1 307="16.1.25.1900"
)");
  EXPECT_EQ(tree.position(described(tree, "Management Engine")), "0000:00:16.0");
  EXPECT_EQ(tree.position(2), "0000:00:16.0/firmware");
  EXPECT_EQ(tree.position(3), "0000:00:16.0/firmware:2");
}

TEST(EngineSource, AnEngineThatTellsNoVersionIsReported) {
  Machine machine(engine);
  machine.add("sys/devices/pci0000:00/0000:00:16.0/mei/mei0/fw_ver = 0:0.0.0.0");
  const NodeTree tree = discoverAt(machine);
  EXPECT_EQ(shown(tree), "40 Computer System\n");
  EXPECT_TRUE(reportOn(tree, "engine", "fw_ver"));
}

TEST(EngineSource, KernelsWithoutTheAttributeHaveNothingToReport) {
  const Machine machine("sys/class/mei/mei0/dev = 10:0");
  const NodeTree tree = discoverAt(machine);
  EXPECT_EQ(shown(tree), "40 Computer System\n");
  EXPECT_FALSE(reportOn(tree, "engine", ""));
}

}  // namespace
}  // namespace agent::discovery::test
