// Where what all sources found comes together.
#include <agent/discovery/Elements.h>
#include <agent/discovery/Merge.h>
#include <agent/discovery/SameElement.h>

#include <gtest/gtest.h>

namespace agent::discovery::test {
namespace {

using namespace Oru;

std::string textOf(const FoundNode& node, int property) {
  for (const auto& [known, text] : node.texts) {
    if (known == property) {
      return text;
    }
  }
  return "-";
}

DeclaredFirmware declaration(const std::string& version, const std::string& kind = "") {
  return {45, firmwareNode("declared/x", "Declared Firmware", version, {"declared", "maker"}), kind, {}};
}

TEST(Merge, KeepsTheOrderOfSourcesAndOfTheirNodes) {
  std::vector<SourceResult> results(2);
  results[0].nodes = {deviceNode("a", "A"), deviceNode("b", "B")};
  results[1].nodes = {deviceNode("c", "C")};
  const std::vector<FoundNode> nodes = mergeResults(results);
  ASSERT_EQ(nodes.size(), 3U);
  EXPECT_EQ(nodes[0].description, "A");
  EXPECT_EQ(nodes[1].description, "B");
  EXPECT_EQ(nodes[2].description, "C");
}

TEST(Merge, ANodeThatTwoSourcesFoundIsOneWithWhatBothTell) {
  std::vector<SourceResult> results(2);
  results[0].nodes = {deviceNode("tpm0", "TPM", {"first", {}})};
  results[0].nodes[0].children = {firmwareNode("tpm0/firmware", "TPM Firmware", "1")};
  results[1].nodes = {deviceNode("tpm0", "Other", {"second", "maker"})};
  results[1].nodes[0].children = {firmwareNode("tpm0/firmware", "TPM Firmware", "2"),
                                  firmwareNode("tpm0/loader", "TPM Loader", "3")};
  results[1].nodes[0].children[0].setValue(NodeLexicon::MajorVersionProperty, 2);
  const std::vector<FoundNode> nodes = mergeResults(results);
  ASSERT_EQ(nodes.size(), 1U);
  EXPECT_EQ(nodes[0].description, "TPM");
  EXPECT_EQ(textOf(nodes[0], NodeLexicon::NameProperty), "first");
  EXPECT_EQ(textOf(nodes[0], NodeLexicon::ManufacturerProperty), "maker");
  ASSERT_EQ(nodes[0].children.size(), 2U);
  EXPECT_EQ(textOf(nodes[0].children[0], NodeLexicon::VersionStringProperty), "1");
  EXPECT_EQ(nodes[0].children[0].numbers.size(), 1U);
  EXPECT_EQ(nodes[0].children[1].description, "TPM Loader");
}

TEST(Merge, NodesOfOneSourceAtOnePlaceStaySeveral) {
  std::vector<SourceResult> results(1);
  results[0].nodes = {deviceNode("a", "A"), deviceNode("a", "B")};
  EXPECT_EQ(mergeResults(results).size(), 2U);
}

TEST(Merge, ADeclarationGoesToTheElementOfItsKindThatALaterSourceFound) {
  std::vector<SourceResult> results(2);
  results[0].declared = {declaration("2.5", "BMC Firmware")};
  results[1].nodes = {firmwareNode("bmc", "BMC Firmware", "2.05")};
  const std::vector<FoundNode> nodes = mergeResults(results);
  ASSERT_EQ(nodes.size(), 1U);
  EXPECT_EQ(textOf(nodes[0], NodeLexicon::VersionStringProperty), "2.05") << "what was found stands";
  EXPECT_EQ(textOf(nodes[0], NodeLexicon::ManufacturerProperty), "maker");
}

TEST(Merge, OfAKindThatWasFoundInAnotherVersionTheDeclarationIsNotDescribedSo) {
  std::vector<SourceResult> results(2);
  results[0].declared = {declaration("3.0", "BMC Firmware"), declaration("1.1", "Fan Firmware")};
  results[1].nodes = {firmwareNode("bmc", "BMC Firmware", "2.05")};
  const std::vector<FoundNode> nodes = mergeResults(results);
  ASSERT_EQ(nodes.size(), 3U);
  EXPECT_EQ(nodes[0].description, "Declared Firmware");
  EXPECT_EQ(nodes[1].description, "Fan Firmware");
  EXPECT_EQ(nodes[2].description, "BMC Firmware");
}

TEST(Merge, TheElementOfAKindWithoutAVersionGetsTheDeclaredOne) {
  std::vector<SourceResult> results(1);
  results[0].nodes = {FoundNode{NodeLexicon::FirmwareNode, "bios", "BIOS", {}, {}, {}}};
  results[0].declared = {declaration("3.0", "BIOS")};
  const std::vector<FoundNode> nodes = mergeResults(results);
  ASSERT_EQ(nodes.size(), 1U);
  EXPECT_EQ(textOf(nodes[0], NodeLexicon::VersionStringProperty), "3.0");
}

TEST(Merge, TheSameIdIsEnough) {
  std::vector<SourceResult> results(2);
  results[0].declared = {declaration("1.27")};
  results[0].declared[0].node.setText(FirmwareIdProperty, "0f3a");
  results[1].nodes = {firmwareNode("esrt:0f3a", "Device Firmware", "0x0001001b")};
  results[1].nodes[0].setText(FirmwareIdProperty, "0f3a");
  EXPECT_EQ(textOf(mergeResults(results).at(0), NodeLexicon::VersionStringProperty), "0x0001001b");
  results[0].declared = {declaration("1.27")};
  results[0].declared[0].node.setText(FirmwareIdProperty, "0f3a");
  results[0].nodes.clear();
  results[1].nodes = {firmwareNode("esrt:0f3a", "Device Firmware", "0x0001001b")};
  results[1].nodes[0].setText(FirmwareIdProperty, "0f3a");
  results[1].nodes[0].otherVersions = {"1.27"};
  const std::vector<FoundNode> nodes = mergeResults(results);
  ASSERT_EQ(nodes.size(), 1U);
  EXPECT_EQ(textOf(nodes[0], NodeLexicon::VersionStringProperty), "1.27") << "the machine's own text";
}

TEST(Merge, ADeclaredDeviceIsMadeOnceForAllOfItsFirmware) {
  std::vector<SourceResult> results(1);
  for (const char* version : {"1", "2"}) {
    DeclaredFirmware declared = declaration(version);
    declared.device = deviceNode("dmi:39/PSU 1", "Power Supply");
    results[0].declared.push_back(declared);
  }
  const std::vector<FoundNode> nodes = mergeResults(results);
  ASSERT_EQ(nodes.size(), 1U);
  EXPECT_EQ(nodes[0].children.size(), 2U);
}

TEST(SameElement, VersionsDifferByMoreThanLeadingZeros) {
  EXPECT_TRUE(isSameVersion("2.05", "2.5"));
  EXPECT_TRUE(isSameVersion("02.5.007", "2.05.7"));
  EXPECT_TRUE(isSameVersion("0.0", "00.0"));
  EXPECT_FALSE(isSameVersion("2.50", "2.5"));
  EXPECT_FALSE(isSameVersion("2.0", "2."));
  EXPECT_FALSE(isSameVersion("2.5a", "2.5"));
  EXPECT_FALSE(isSameVersion("U01", "U1")) << "a number that a text begins before";
}

TEST(SameElement, NamesSayNoMoreThanADescription) {
  for (const char* name : {"BIOS", "System BIOS", "UEFI", "BIOS/UEFI Firmware", "System Firmware (BIOS)",
                           "System ROM", "system firmware"}) {
    EXPECT_TRUE(isNameOf(name, "BIOS")) << name;
  }
  EXPECT_TRUE(isNameOf("Baseboard Management Controller", "BMC Firmware"));
  EXPECT_TRUE(isNameOf("EC Firmware", "Embedded Controller Firmware"));
  for (const char* name :
       {"", "Firmware", "NIC UEFI option ROM", "Redundant System ROM", "BIOS 2", "BMC", "Bios-Diagnostics"}) {
    EXPECT_FALSE(isNameOf(name, "BIOS")) << name;
  }
}

}  // namespace
}  // namespace agent::discovery::test
