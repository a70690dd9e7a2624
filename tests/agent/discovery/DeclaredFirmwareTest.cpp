// Firmware that SMBIOS tables declare (type 45), in a machine's tree.
#include "Machine.h"
#include "SmbiosBuilder.h"

#include <agent/framework/OwnNumbers.h>

#include <Oru/NodeLexicon.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace agent::discovery::test {
namespace {

using namespace Oru;

void writeTable(Machine& machine, const std::string& description) {
  const std::string table = smbiosTable(description);
  machine.write("sys/firmware/dmi/tables/DMI", table);
  machine.write("sys/firmware/dmi/tables/smbios_entry_point", entryPoint64(3, 7, table.size()));
}

NodeTree treeOf(const std::string& description) {
  Machine machine("");
  writeTable(machine, description);
  return discoverAt(machine);
}

constexpr const char* bios =
    "0 @0x0000: 1b 2b 0w 3b 3b 0q 0w 2b 14b 255b 255b | Corvane | 2.14.1 | 03/09/2023\n";
constexpr const char* biosNode = "  3 BIOS 36=\"Corvane\" 104=2 107=14 164=\"03/09/2023\" 307=\"2.14.1\"";

/// A declared element: name, version and date; `tail` from the characteristics on.
std::string declared(const std::string& name, const std::string& version, const std::string& date = "",
                     const std::string& tail = "1w 4b 0b") {
  return "45 @0x2d: 1b 2b 0b 0b 0b " + std::string(date.empty() ? "0b" : "3b") + " 0b 0b 0q " + tail + " | " +
         name + " | " + version + (date.empty() ? "" : " | " + date) + "\n";
}

TEST(DeclaredFirmware, ShowsAllThatIsDeclared) {
  const NodeTree tree = treeOf(
      "45 @0x2d: 1b 2b 1b 3b 1b 4b 5b 6b 0x00100000q 0x0003w 4b 0b "
      "| Backplane | 31007.2 | 0F3A6F2C-11B1-4B4B-9F2C-000000000001 | 2022-04-11T00:00:00Z | Corvane | 1.2\n"
      "end");
  const NodeTree::Index node = described(tree, "Declared Firmware");
  ASSERT_NE(node, NodeTree::none);
  EXPECT_EQ(tree.type(node), NodeLexicon::FirmwareNode);
  EXPECT_EQ(tree.text(node, NodeLexicon::NameProperty), "Backplane");
  EXPECT_EQ(tree.text(node, NodeLexicon::VersionStringProperty), "31007.2");
  EXPECT_EQ(tree.value(node, NodeLexicon::MajorVersionProperty), 31007U);
  EXPECT_EQ(tree.value(node, NodeLexicon::MinorVersionProperty), 2U);
  EXPECT_EQ(tree.text(node, NodeLexicon::ReleaseDateProperty), "04/11/2022");
  EXPECT_EQ(tree.text(node, NodeLexicon::ManufacturerProperty), "Corvane");
  EXPECT_EQ(tree.text(node, FirmwareIdProperty), "0f3a6f2c-11b1-4b4b-9f2c-000000000001");
  EXPECT_EQ(tree.text(node, LowestVersionProperty), "1.2");
  EXPECT_EQ(tree.value(node, ImageSizeProperty), 0x100000U);
  EXPECT_EQ(tree.text(node, UpdateProperty), "updatable, write-protected");
  EXPECT_EQ(tree.text(node, StateProperty), "enabled");
}

TEST(DeclaredFirmware, AVersionHasNumbersOnlyWhereItsFormatIsMajorMinor) {
  const auto numbers = [](const std::string& format, const std::string& version) {
    const NodeTree tree = treeOf("45 @1: 1b 2b " + format + " 0b 0b 0b 0b 0b 0q 0w 4b 0b | x | " + version);
    const NodeTree::Index node = described(tree, "Declared Firmware");
    return tree.value(node, NodeLexicon::MajorVersionProperty).has_value();
  };
  EXPECT_TRUE(numbers("1b", "2.14"));
  EXPECT_FALSE(numbers("0b", "2.14")) << "free form";
  EXPECT_FALSE(numbers("2b", "0x0002000e"));
  EXPECT_FALSE(numbers("128b", "2.14")) << "a maker's own format";
  EXPECT_FALSE(numbers("1b", "K71V204"));
}

TEST(DeclaredFirmware, UnsetIdsAndDatesAndUnknownSizesAndStatesAreAbsent) {
  const NodeTree tree = treeOf(
      "45 @0x2d: 1b 2b 0b 3b 1b 4b 5b 6b 0xffffffffffffffffq 0w 2b 0b "
      "| Default string | 1 | 00000000-0000-0000-0000-000000000000 | 0000-00-00T00:00:00Z | N/A | None\nend");
  EXPECT_EQ(shown(tree), "40 Computer System\n  3 Declared Firmware 307=\"1\" 1008=\"not updatable\"\n");
}

TEST(DeclaredFirmware, ADateOfAnUnknownFormIsSaid) {
  const NodeTree tree = treeOf(declared("x", "1", "last week") + "end");
  EXPECT_EQ(
      shown(tree),
      "40 Computer System\n  3 Declared Firmware 108=\"x\" 307=\"1\" 1004=\"enabled\" 1008=\"updatable\"\n");
  EXPECT_EQ(reportOn(tree, "dmi", "structure 0x002d of type 45")->detail,
            "\"last week\" is no date of a known form");
}

TEST(DeclaredFirmware, TooShortForItsFieldsItKeepsThoseItHasAndIsReported) {
  const NodeTree tree = treeOf("45 @0x26: 1b 2b 0b 0b 0b 0b 0b 0b 4096q 0w 4b | Panel | 3\nend");
  EXPECT_EQ(shown(tree),
            "40 Computer System\n  3 Declared Firmware 108=\"Panel\" 307=\"3\" 1004=\"enabled\" 1007=4096 "
            "1008=\"not updatable\"\n");
  EXPECT_EQ(reportOn(tree, "dmi", "structure 0x0026 of type 45")->detail,
            "it has 23 bytes, expected 24: the fields beyond them are missing");
}

TEST(DeclaredFirmware, WithoutAVersionOrDeclaredAsAbsentItIsSaidAndLeftOut) {
  const NodeTree tree = treeOf("45 @1: 1b 0b 0b 0b 0b 0b 0b 0b 0q 0w 4b 0b | Fan\n" +
                               declared("Riser", "1", "", "0w 5b 0b") + "end");
  EXPECT_EQ(shown(tree), "40 Computer System\n");
  EXPECT_EQ(reportOn(tree, "dmi", "structure 0x0001 of type 45")->detail, "\"Fan\" has no version");
  EXPECT_EQ(reportOn(tree, "dmi", "structure 0x002d of type 45")->detail, "\"Riser\" is declared as absent");
}

TEST(DeclaredFirmware, NoNameChangesWhatAnElementIs) {
  for (const char* name : {"NIC UEFI option ROM", "BIOS", "BMC Firmware", "FPGA Firmware", "Baseboard",
                           "Diagnostic", "System BIOS"}) {
    const NodeTree tree = treeOf(bios + declared(name, "1.0") + "end");
    const NodeTree::Index node = described(tree, "Declared Firmware");
    ASSERT_NE(node, NodeTree::none) << name;
    EXPECT_EQ(tree.text(node, NodeLexicon::NameProperty), name);
    EXPECT_EQ(tree.text(node, NodeLexicon::VersionStringProperty), "1.0");
    EXPECT_EQ(tree.size(), 3U) << name;
  }
}

TEST(DeclaredFirmware, TheSystemFirmwareDeclaredAgainIsMergedIntoIt) {
  // by its date, by its name, by the structure it points to
  EXPECT_EQ(shown(treeOf(bios + declared("Main image", "2.14.1", "2023-03-09") + "end")),
            "40 Computer System\n  3 BIOS 36=\"Corvane\" 104=2 107=14 108=\"Main image\" 164=\"03/09/2023\" "
            "307=\"2.14.1\" 1004=\"enabled\" 1008=\"updatable\"\n");
  EXPECT_EQ(treeOf(bios + declared("System BIOS", "2.14.1") + "end").size(), 2U);
  EXPECT_EQ(treeOf(bios + declared("Image 1", "2.14.1", "", "1w 4b 1b 0x0000w") + "end").size(), 2U);
}

TEST(DeclaredFirmware, TheSameVersionAloneMergesNothing) {
  EXPECT_EQ(treeOf(bios + declared("NIC UEFI option ROM", "2.14.1") + "end").size(), 3U);
  EXPECT_EQ(treeOf(bios + declared("System BIOS", "2.14.2", "2023-03-09") + "end").size(), 3U);
}

TEST(DeclaredFirmware, AHandleOfTheSystemFirmwareUnderAnotherVersionMakesNoSecondBios) {
  // Boards exist that leave the handle of other firmware at 0, which is the system firmware's.
  const NodeTree tree = treeOf(bios + declared("Backplane", "31007.2", "", "0w 4b 1b 0x0000w") + "end");
  EXPECT_EQ(shown(tree), "40 Computer System\n" + std::string(biosNode) +
                             "\n  3 Declared Firmware 108=\"Backplane\" 307=\"31007.2\" 1004=\"enabled\" "
                             "1008=\"not updatable\"\n");
}

TEST(DeclaredFirmware, ASpareImageOfTheSameVersionStaysAnElementOfItsOwn) {
  const NodeTree tree = treeOf(bios + declared("System BIOS", "2.14.1", "", "1w 4b 1b 0w") +
                               declared("Redundant BIOS", "2.14.1", "", "1w 7b 1b 0w") + "end");
  ASSERT_EQ(tree.size(), 3U);
  EXPECT_EQ(tree.description(2), "Declared Firmware");
  EXPECT_EQ(tree.text(2, StateProperty), "spare");
}

TEST(DeclaredFirmware, TheTpmsDeclaredAgainKeepsTheMachinesOwnText) {
  const NodeTree tree = treeOf(bios + std::string("43 @8: 0x00565243d 2b 0b 0x00031007d 2d 0b 0q 0d\n") +
                               declared("TPM Firmware", "31007.2", "2022-04-11", "0w 4b 1b 0w") + "end");
  EXPECT_EQ(shown(tree),
            "40 Computer System\n" + std::string(biosNode) +
                "\n  1000 TPM 36=\"CRV\"\n"
                "    3 TPM Firmware 36=\"CRV\" 104=3 107=4103 108=\"TPM Firmware\" 164=\"04/11/2022\" "
                "307=\"31007.2\" 1004=\"enabled\" 1008=\"not updatable\"\n");
}

TEST(DeclaredFirmware, StandsBelowTheDeviceThatItsComponentIs) {
  const NodeTree tree = treeOf(
      "41 @0x29: 1b 0x85b 1b 0w 0x3bb 0x08b | Onboard LAN\n"
      "9 @0x09: 1b 0b 0b 0b 0b 0w 0b 0b 0w 0xffb 0xffb | Slot 4\n"
      "39 @0x27: 0b 1b | PSU 2\n"
      "43 @0x2b: 0d 2b 0b 0d 0d 0b 0q 0d\n" +
      declared("LAN", "1", "", "0w 2b 1b 0x29w") + declared("Slot card", "2", "", "0w 2b 1b 9w") +
      declared("Supply", "3", "", "0w 2b 2b 0x77w 0x27w") + declared("Security", "4", "", "0w 2b 1b 0x2bw") +
      "end");
  EXPECT_EQ(shown(tree),
            "40 Computer System\n"
            "  3 Declared Firmware 108=\"Slot card\" 307=\"2\" 1008=\"not updatable\"\n"
            "  1000 Onboard Device 108=\"Onboard LAN\"\n"
            "    3 Declared Firmware 108=\"LAN\" 307=\"1\" 1008=\"not updatable\"\n"
            "  1000 Power Supply 108=\"PSU 2\"\n"
            "    3 Declared Firmware 108=\"Supply\" 307=\"3\" 1008=\"not updatable\"\n"
            "  1000 TPM\n"
            "    3 TPM Firmware 108=\"Security\" 307=\"4\" 1008=\"not updatable\"\n");
  EXPECT_EQ(tree.position(described(tree, "Onboard Device")), "0000:3b:01.0");
  EXPECT_TRUE(reportOn(tree, "dmi", "structure 0x002b of type 43")) << "without a version of its own";
}

TEST(DeclaredFirmware, OfANetworkDeviceStandsBelowItAndRepeatsItsFirmware) {
  constexpr const char* network = R"(
    sys/class/net/eno1 -> ../../devices/pci0000:00/0000:3b:00.0/net/eno1
    sys/devices/pci0000:00/0000:3b:00.0/subsystem -> ../../../bus/pci
    sys/devices/pci0000:00/0000:3b:00.0/net/eno1/device -> ../../../0000:3b:00.0
  )";
  Machine machine(network);
  writeTable(machine, "41 @0x29: 1b 0x85b 1b 0w 0x3bb 0b | LAN\n" +
                          declared("LAN boot image", "1.02", "2023-03-09", "1w 4b 1b 0x29w") +
                          declared("LAN option ROM", "7", "", "1w 4b 1b 0x29w") + "end");
  const auto ethtool =
      std::make_shared<FakeEthtool>(std::map<std::string, FakeEthtool::Told>{{"eno1", {"", "1.2", 0}}});
  const NodeTree tree = discoverAt(machine, ethtool);
  EXPECT_EQ(shown(tree),
            "40 Computer System\n"
            "  49 Network Device\n"
            "    3 Network Firmware 108=\"LAN boot image\" 164=\"03/09/2023\" 307=\"1.2\" 1004=\"enabled\" "
            "1008=\"updatable\"\n"
            "    12 eno1 108=\"0000:3b:00.0/1\"\n"
            "    3 Declared Firmware 108=\"LAN option ROM\" 307=\"7\" 1004=\"enabled\" 1008=\"updatable\"\n");
}

TEST(DeclaredFirmware, OfTheManagementControllerIsDescribedSoWhereItsStructureSaysSo) {
  const NodeTree tree = treeOf("38 @0x26: 1b 0x20b 0x20b 0xffb 0q\n" +
                               declared("Lights-out", "2.14", "", "1w 4b 1b 0x26w") + "end");
  EXPECT_NE(described(tree, "BMC Firmware"), NodeTree::none);
}

TEST(DeclaredFirmware, MoreThanAnyMachineHasAreCountedAndLeftOut) {
  std::string many = bios;
  for (int i = 0; i < 1026; ++i) {
    many += declared("x", std::to_string(i));
  }
  const NodeTree tree = treeOf(many + "end");
  EXPECT_EQ(tree.size(), 1026U);
  EXPECT_EQ(reportOn(tree, "dmi", "tables/DMI")->detail,
            "1026 structures of type 45, expected 1024 at most: the others are left out");
}

}  // namespace
}  // namespace agent::discovery::test
