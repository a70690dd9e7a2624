// The firmware of the TPM.
#include "Machine.h"

#include <agent/discovery/tpm/TpmCapabilities.h>

#include <gtest/gtest.h>

namespace agent::discovery::test {
namespace {

constexpr const char* capabilityLines =
    "Manufacturer: 0x49465800\nTCG version: 1.2\nFirmware version: 4.32\n";

TEST(TpmCapabilityLines, AreReadByTheirNames) {
  const TpmCapabilities capabilities = parseTpmCapabilities(capabilityLines);
  EXPECT_EQ(capabilities.maker, "IFX");
  EXPECT_EQ(capabilities.version, "4.32") << "the firmware's version, not the standard's";
  EXPECT_EQ(capabilities.major, 4U);
  EXPECT_EQ(capabilities.minor, 32U);
}

TEST(TpmCapabilityLines, OtherFormsAreAbsent) {
  EXPECT_EQ(parseTpmCapabilities("").version, std::nullopt);
  EXPECT_EQ(parseTpmCapabilities("TCG version: 1.2\n").version, std::nullopt);
  EXPECT_EQ(parseTpmCapabilities("Firmware version: 0.0\n").version, std::nullopt);
  EXPECT_EQ(parseTpmCapabilities("Firmware version:").version, std::nullopt);
  EXPECT_EQ(parseTpmCapabilities("Firmware version: A1\n").version, "A1");
  EXPECT_EQ(parseTpmCapabilities("Firmware version: A1\n").major, std::nullopt);
  EXPECT_EQ(parseTpmCapabilities("Manufacturer: 0x01020304\n").maker, std::nullopt);
  EXPECT_EQ(parseTpmCapabilities("Manufacturer: 0x20202020\n").maker, std::nullopt);
  EXPECT_EQ(parseTpmCapabilities("Manufacturer: IFX\n").maker, std::nullopt);
  EXPECT_EQ(parseTpmCapabilities("Manufacturer: 0x53544d20\n").maker, "STM") << "the blank fills up";
}

TEST(TpmSource, ATpmWithItsFirmware) {
  Machine machine(R"(
    sys/class/tpm/tpm0 -> ../../devices/pnp0/00:05/tpm/tpm0
    sys/devices/pnp0/00:05/subsystem -> ../../../bus/pnp
    sys/devices/pnp0/00:05/tpm/tpm0/tpm_version_major = 1
  )");
  machine.write("sys/devices/pnp0/00:05/tpm/tpm0/caps", capabilityLines);
  const NodeTree tree = discoverAt(machine);
  EXPECT_EQ(shown(tree), R"(40 Computer System
  1000 TPM 36="IFX"
    3 TPM Firmware 36="IFX" 104=4 107=32 307="4.32"
)");
  EXPECT_EQ(tree.position(described(tree, "TPM")), "tpm:pnp:00:05");
}

TEST(TpmSource, OlderKernelsHaveTheLinesWithTheDevice) {
  Machine machine("");
  machine.write("sys/class/tpm/tpm0/device/caps", capabilityLines);
  EXPECT_NE(described(discoverAt(machine), "TPM Firmware"), NodeTree::none);
}

TEST(TpmSource, OfATpm2TheKernelShowsNoVersionAndThatIsSaid) {
  const Machine machine("sys/class/tpm/tpm0/tpm_version_major = 2");
  const NodeTree tree = discoverAt(machine);
  EXPECT_EQ(shown(tree), "40 Computer System\n");
  const auto report = reportOn(tree, "tpm", "sys/class/tpm/tpm0");
  ASSERT_TRUE(report);
  EXPECT_EQ(report->reason, SourceReport::Reason::Absent);
}

TEST(TpmSource, CapabilitiesWithoutAVersionAreReported) {
  Machine machine("sys/class/tpm/tpm0/caps = Manufacturer: 0x49465800");
  const NodeTree tree = discoverAt(machine);
  EXPECT_EQ(shown(tree), "40 Computer System\n");
  EXPECT_TRUE(reportOn(tree, "tpm", "sys/class/tpm/tpm0"));
}

}  // namespace
}  // namespace agent::discovery::test
