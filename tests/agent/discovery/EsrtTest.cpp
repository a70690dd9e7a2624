// The firmware that can be updated through UEFI.
#include "Machine.h"

#include <agent/discovery/esrt/ResourceEntry.h>

#include <gtest/gtest.h>

namespace agent::discovery::test {
namespace {

std::string entry(int number, const std::string& classId, const std::string& type,
                  const std::string& version) {
  const std::string folder = "sys/firmware/efi/esrt/entries/entry" + std::to_string(number) + "/";
  return folder + "fw_class = " + classId + "\n" + folder + "fw_type = " + type + "\n" + folder +
         "fw_version = " + version + "\n" + folder + "lowest_supported_fw_version = 0\n" + folder +
         "last_attempt_version = 0\n" + folder + "last_attempt_status = 0\n";
}

constexpr const char* systemClass = "3B8C8162-188C-46A4-AEC9-BE43F1D65697";
constexpr const char* deviceClass = "9bfe0f2a-6d1b-4f5c-8e7a-1c2d3e4f5a6b";

TEST(ResourceClassId, IsAGuidInLowerCase) {
  EXPECT_EQ(parseClassId(systemClass), "3b8c8162-188c-46a4-aec9-be43f1d65697");
  for (const char* text :
       {"", "3b8c8162", "3b8c8162-188c-46a4-aec9-be43f1d6569", "3b8c8162-188c-46a4-aec9-be43f1d656977",
        "3b8c8162x188c-46a4-aec9-be43f1d65697", "gb8c8162-188c-46a4-aec9-be43f1d65697"}) {
    EXPECT_EQ(parseClassId(text), std::nullopt) << text;
  }
}

TEST(ResourceClassId, OfZerosIsNone) {
  EXPECT_EQ(parseClassId("00000000-0000-0000-0000-000000000000"), std::nullopt);
}

TEST(ResourceVersion, IsShownAsItsDigits) {
  EXPECT_EQ(versionText(65563), "0x0001001b");
  EXPECT_EQ(versionText(0xffffffff), "0xffffffff");
  EXPECT_EQ(versionText(0), std::nullopt);
}

TEST(ResourceVersion, HasTheFormsThatMakersWrite) {
  EXPECT_EQ(versionForms(0x0102001b), (std::vector<std::string>{"16908315", "1.2.0.27", "258.27", "1.2.27"}));
  EXPECT_EQ(versionForms(0xffffffff),
            (std::vector<std::string>{"4294967295", "255.255.255.255", "65535.65535", "255.255.65535"}));
}

TEST(ResourceAttempt, HasWordsForTheStandardsNumbers) {
  EXPECT_EQ(attemptText(0), "success");
  EXPECT_EQ(attemptText(5), "authentication failed");
  EXPECT_EQ(attemptText(8), "unsatisfied dependencies");
  EXPECT_EQ(attemptText(9), "status 9");
}

TEST(EsrtSource, EntriesAreCalledByTheirType) {
  const Machine machine(entry(0, systemClass, "1", "65563") + entry(1, deviceClass, "2", "16909060") +
                        entry(2, "11111111-0000-0000-0000-000000000003", "3", "3") +
                        entry(3, "11111111-0000-0000-0000-000000000004", "0", "4"));
  const NodeTree tree = discoverAt(machine);
  EXPECT_EQ(shown(tree), R"(40 Computer System
  3 UEFI System Firmware 307="0x0001001b" 1005="3b8c8162-188c-46a4-aec9-be43f1d65697"
  3 Device Firmware Resource 307="0x01020304" 1005="9bfe0f2a-6d1b-4f5c-8e7a-1c2d3e4f5a6b"
  3 UEFI Driver 307="0x00000003" 1005="11111111-0000-0000-0000-000000000003"
  3 Firmware Resource 307="0x00000004" 1005="11111111-0000-0000-0000-000000000004"
)");
  EXPECT_EQ(tree.position(1), "esrt:3b8c8162-188c-46a4-aec9-be43f1d65697");
}

TEST(EsrtSource, ZeroClassIdsAreUnusedEntries) {
  const Machine machine(entry(0, "00000000-0000-0000-0000-000000000000", "1", "1"));
  const NodeTree tree = discoverAt(machine);
  EXPECT_EQ(shown(tree), "40 Computer System\n");
  EXPECT_FALSE(reportOn(tree, "esrt", ""));
}

TEST(EsrtSource, LowestVersionAndLastAttemptAreKept) {
  Machine machine(entry(0, deviceClass, "2", "65563"));
  machine.add(R"(
    sys/firmware/efi/esrt/entries/entry0/lowest_supported_fw_version = 65536
    sys/firmware/efi/esrt/entries/entry0/last_attempt_version = 65564
    sys/firmware/efi/esrt/entries/entry0/last_attempt_status = 7
  )");
  EXPECT_EQ(shown(discoverAt(machine)),
            "40 Computer System\n"
            "  3 Device Firmware Resource 307=\"0x0001001b\" 1005=\"9bfe0f2a-6d1b-4f5c-8e7a-1c2d3e4f5a6b\""
            " 1006=\"0x00010000\" 1009=\"0x0001001c: power, battery too low\"\n");
}

TEST(EsrtSource, AVersionOfZeroOrOfAnotherFormIsReported) {
  const Machine machine(entry(0, systemClass, "1", "0") + entry(1, deviceClass, "2", "1.2"));
  const NodeTree tree = discoverAt(machine);
  EXPECT_EQ(shown(tree), "40 Computer System\n");
  EXPECT_EQ(reportOn(tree, "esrt", "entry0/fw_version")->reason, SourceReport::Reason::Absent);
  EXPECT_EQ(reportOn(tree, "esrt", "entry1/fw_version")->reason, SourceReport::Reason::Unreadable);
}

TEST(EsrtSource, WhatCannotBeReadIsSaid) {
  // A folder in the place of the attribute, since root may read every file.
  const Machine machine("sys/firmware/efi/esrt/entries/entry0/fw_class/");
  const auto report = reportOn(discoverAt(machine), "esrt", "entry0/fw_class");
  ASSERT_TRUE(report);
  EXPECT_EQ(report->reason, SourceReport::Reason::Unreadable);
}

}  // namespace
}  // namespace agent::discovery::test
