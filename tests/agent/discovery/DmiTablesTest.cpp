// The SMBIOS tables in a machine's tree.
#include "Machine.h"
#include "SmbiosBuilder.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>
#include <stdexcept>

#include <unistd.h>

namespace agent::discovery::test {
namespace {

using testing::HasSubstr;

constexpr const char* folder = "sys/firmware/dmi/tables/";

void writeTable(Machine& machine, const std::string& table, const std::string& entryPoint) {
  machine.write(std::string(folder) + "DMI", table);
  machine.write(std::string(folder) + "smbios_entry_point", entryPoint);
}

NodeTree treeOf(const std::string& table, const std::string& entryPoint) {
  Machine machine("");
  writeTable(machine, table, entryPoint);
  return discoverAt(machine);
}

NodeTree treeOf(std::string_view description) {
  const std::string table = smbiosTable(description);
  return treeOf(table, entryPoint64(3, 7, table.size()));
}

constexpr const char* bios =
    "0 @0x0000: 1b 2b 0xf000w 3b 3b 0q 0w 5b 17b 255b 255b 0w | Corvane Ltd. | U41 v2.66  | 03/09/2023\n";

constexpr const char* biosNode =
    "40 Computer System\n"
    "  3 BIOS 36=\"Corvane Ltd.\" 104=5 107=17 164=\"03/09/2023\" 307=\"U41 v2.66\"\n";

TEST(DmiTables, Type0IsTheSystemFirmwareAndNothingIsLeftToSay) {
  const NodeTree tree = treeOf(std::string(bios) + "end");
  EXPECT_EQ(shown(tree), biosNode);
  EXPECT_FALSE(reportOn(tree, "dmi", ""));
}

TEST(DmiTables, Type0IsFoundWhereverItStandsAndTheFirstCounts) {
  const NodeTree tree = treeOf("1 @1: 1b | Corvane\n43 @2: 0d 2b 0b 0x00010002d 0d 0b 0q 0d\n" +
                               std::string(bios) + "0 @9: 1b 2b | Other | 1\nend");
  EXPECT_EQ(shown(tree), std::string(biosNode) +
                             "  1000 TPM\n"
                             "    3 TPM Firmware 104=1 107=2 307=\"1.2\"\n");
}

TEST(DmiTables, EmbeddedControllerFirmwareStandsBelowItsDevice) {
  const NodeTree tree = treeOf("0 @0: 0b 1b 0w 0b 0b 0q 0w 255b 255b 1b 32b | 7\nend");
  EXPECT_EQ(shown(tree),
            "40 Computer System\n"
            "  3 BIOS 307=\"7\"\n"
            "  1000 Embedded Controller\n"
            "    3 Embedded Controller Firmware 104=1 107=32 307=\"1.32\"\n");
}

TEST(DmiTables, Type0OfTwentyBytesHasNoRelease) {
  const NodeTree tree = treeOf("0 @0: 1b 2b 0xf000w 3b 3b 0q 0w | Corvane | 080014  | 11/06/98\nend");
  EXPECT_EQ(shown(tree), "40 Computer System\n  3 BIOS 36=\"Corvane\" 164=\"11/06/1998\" 307=\"080014\"\n");
}

TEST(DmiTables, Type0OfAHeaderAloneIsNoFirmwareAndIsReported) {
  const NodeTree tree = treeOf("0 @0:\nend");
  EXPECT_EQ(shown(tree), "40 Computer System\n");
  for (const char* name : {"vendor", "version", "release date"}) {
    const auto report = reportOn(tree, "dmi", std::string("structure 0x0000 of type 0, ") + name);
    ASSERT_TRUE(report) << name;
    EXPECT_EQ(report->reason, SourceReport::Reason::Absent);
  }
}

TEST(DmiTables, WhatOnlyStandsInForAValueIsAbsentAndReported) {
  const NodeTree tree = treeOf("0 @0: 1b 2b 0w 3b 3b | To Be Filled By O.E.M. | 1.0 | 2023-03-09\nend");
  EXPECT_EQ(shown(tree), "40 Computer System\n  3 BIOS 307=\"1.0\"\n");
  EXPECT_EQ(reportOn(tree, "dmi", "type 0, vendor")->detail, "it says nothing: \"To Be Filled By O.E.M.\"");
  EXPECT_EQ(reportOn(tree, "dmi", "type 0, release date")->detail,
            "\"2023-03-09\" is no date of the form month/day/year");
}

TEST(DmiTables, EntryPointsOf32And64BitsLeadToTheSame) {
  const std::string table = smbiosTable(std::string(bios) + "end");
  EXPECT_EQ(shown(treeOf(table, entryPoint64(3, 0, table.size()))), biosNode);
  EXPECT_EQ(shown(treeOf(table, entryPoint32(2, 8, table.size(), 2))), biosNode);
}

TEST(DmiTables, ATableOfVersion3BehindAnEntryPointOfVersion2IsReadWhole) {
  const std::string table = smbiosTable(std::string(bios) +
                                        "45 @0x2d: 1b 2b 0b 0b 0b 0b 0b 0b 0q 1w 4b 0b | PSoC | 7.1\n"
                                        "end");
  for (const unsigned int major : {2U, 3U}) {
    const NodeTree tree = treeOf(table, entryPoint32(major, 0, table.size(), 3));
    EXPECT_EQ(shown(tree), std::string(biosNode) +
                               "  3 Declared Firmware 108=\"PSoC\" 307=\"7.1\" 1004=\"enabled\" "
                               "1008=\"updatable\"\n");
    EXPECT_FALSE(reportOn(tree, "dmi", ""));
  }
}

TEST(DmiTables, StructuresBeyondTheCountOfTheEntryPointAreJunk) {
  const std::string whole = smbiosTable(bios);
  const NodeTree tree =
      treeOf(whole + smbiosTable("45 @1: 1b 2b | Junk | 9\nend"), entryPoint32(2, 4, whole.size(), 1));
  EXPECT_EQ(shown(tree), biosNode);
  EXPECT_THAT(reportOn(tree, "dmi", "tables/DMI")->detail, HasSubstr("what follows its end is left out"));
}

TEST(DmiTables, ADamagedOrMissingEntryPointIsSaidAndTheTableIsReadAllTheSame) {
  const std::string table = smbiosTable(std::string(bios) + "end");
  std::string damaged = entryPoint64(3, 7, table.size());
  damaged[0x05] = static_cast<char>(damaged[0x05] + 1);
  const NodeTree tree = treeOf(table, damaged);
  EXPECT_EQ(shown(tree), biosNode);
  EXPECT_EQ(reportOn(tree, "dmi", "smbios_entry_point")->reason, SourceReport::Reason::Unreadable);

  Machine machine("");
  machine.write(std::string(folder) + "DMI", table);
  const NodeTree without = discoverAt(machine);
  EXPECT_EQ(shown(without), biosNode);
  EXPECT_EQ(reportOn(without, "dmi", "smbios_entry_point")->reason, SourceReport::Reason::Absent);
}

TEST(DmiTables, OfATableCutShortWhatIsWholeIsUsedAndTheRestIsSaid) {
  const std::string whole =
      smbiosTable(std::string(bios) + "45 @1: 1b 2b 0b 0b 0b 0b 0b 0b 0q 0w 4b 0b | Late | 1\nend");
  const std::size_t first = smbiosTable(bios).size();
  const NodeTree tree = treeOf(whole.substr(0, first + 20), entryPoint64(3, 7, whole.size()));
  EXPECT_EQ(shown(tree), biosNode);
  const auto report = reportOn(tree, "dmi", "tables/DMI");
  ASSERT_TRUE(report);
  EXPECT_EQ(report->reason, SourceReport::Reason::Unreadable);
  EXPECT_EQ(report->detail, "it ends within a structure: 1 structures are read, up to byte " +
                                std::to_string(first) + " of " + std::to_string(first + 20) +
                                ", where the entry point tells of " + std::to_string(whole.size()));
}

TEST(DmiTables, AMissingEndMarkerIsSaid) {
  const NodeTree tree = treeOf(bios);
  EXPECT_EQ(shown(tree), biosNode);
  EXPECT_THAT(reportOn(tree, "dmi", "tables/DMI")->detail, HasSubstr("it has no end marker: 1 structures"));
}

TEST(DmiTables, JunkBehindTheLastStructureIsSaid) {
  const std::string table = smbiosTable(bios) + std::string(5003, '\0');
  const NodeTree tree = treeOf(table, entryPoint64(3, 7, table.size()));
  EXPECT_EQ(shown(tree), biosNode);
  EXPECT_THAT(reportOn(tree, "dmi", "tables/DMI")->detail,
              HasSubstr("it has no end marker, and what follows is no structure"));
}

TEST(DmiTables, WhereTheyTellOfNoSystemFirmwareTheAttributesAnswer) {
  Machine machine("sys/class/dmi/id/bios_version = 7");
  const std::string table = smbiosTable("1 @1:\nend");
  writeTable(machine, table, entryPoint64(3, 0, table.size()));
  const NodeTree tree = discoverAt(machine);
  EXPECT_EQ(shown(tree), "40 Computer System\n  3 BIOS 307=\"7\"\n");
  EXPECT_EQ(reportOn(tree, "dmi", "tables/DMI")->detail,
            "no structure of type 0 tells of the system firmware");
}

TEST(DmiTables, ATableBeyondTheLimitIsUnreadableAndTheAttributesAnswer) {
  Machine machine("sys/class/dmi/id/bios_version = 7");
  writeTable(machine, std::string(std::size_t{4} * 1024 * 1024 + 1, '\0'), entryPoint64(3, 0, 1));
  const NodeTree tree = discoverAt(machine);
  EXPECT_NE(described(tree, "BIOS"), NodeTree::none);
  EXPECT_EQ(reportOn(tree, "dmi", "tables/DMI")->reason, SourceReport::Reason::Unreadable);
}

TEST(DmiTables, WhatTheTablesTellStandsForTheAttributesToo) {
  Machine machine("sys/class/dmi/id/bios_version = stale\nsys/class/dmi/id/ec_firmware_release = 9.9");
  const std::string table = smbiosTable(std::string(bios) + "end");
  writeTable(machine, table, entryPoint64(3, 0, table.size()));
  EXPECT_EQ(shown(discoverAt(machine)), biosNode);
}

/// Runs as nobody for its lifetime where the tests run as root.
class OrdinaryUser {
 public:
  OrdinaryUser() {
    if (before_ == 0 && ::seteuid(nobody) != 0) {
      throw std::runtime_error("cannot become an ordinary user");
    }
  }
  OrdinaryUser(const OrdinaryUser&) = delete;
  OrdinaryUser& operator=(const OrdinaryUser&) = delete;
  ~OrdinaryUser() { (void)(before_ == 0 && ::seteuid(before_) != 0); }

 private:
  static constexpr uid_t nobody = 65534;
  uid_t before_ = ::geteuid();
};

TEST(DmiTables, AnOrdinaryUserGetsTheAttributesAndReadsWhatRootWouldAdd) {
  Machine machine(R"(
    sys/class/dmi/id/bios_vendor = Corvane Ltd.
    sys/class/dmi/id/bios_version = U41 v2.66
    sys/class/dmi/id/bios_date = 03/09/2023
    sys/class/dmi/id/bios_release = 5.17
    sys/class/dmi/id/ec_firmware_release = 1.32
  )");
  const std::string table = smbiosTable(std::string(bios) + "end");
  writeTable(machine, table, entryPoint64(3, 0, table.size()));
  namespace fs = std::filesystem;
  constexpr fs::perms readable = fs::perms::owner_all | fs::perms::group_read | fs::perms::group_exec |
                                 fs::perms::others_read | fs::perms::others_exec;
  fs::permissions(machine.root(), readable);
  for (const fs::directory_entry& entry : fs::recursive_directory_iterator(machine.root())) {
    fs::permissions(entry, readable);
  }
  for (const char* name : {"DMI", "smbios_entry_point"}) {
    fs::permissions(machine.root() / folder / name, fs::perms::none);
  }
  const OrdinaryUser ordinary;
  const NodeTree tree = discoverAt(machine);
  EXPECT_EQ(shown(tree), std::string(biosNode) +
                             "  1000 Embedded Controller\n"
                             "    3 Embedded Controller Firmware 104=1 107=32 307=\"1.32\"\n");
  const auto report = reportOn(tree, "dmi", "tables/DMI");
  ASSERT_TRUE(report);
  EXPECT_EQ(report->reason, SourceReport::Reason::NoPermission);
  EXPECT_EQ(report->detail,
            "Permission denied; root reads here the TPM's firmware and what else the machine declares");
  EXPECT_FALSE(reportOn(tree, "dmi", "smbios_entry_point")) << "once is enough";
}

}  // namespace
}  // namespace agent::discovery::test
