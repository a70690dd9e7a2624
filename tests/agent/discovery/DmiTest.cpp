#include "Machine.h"

#include <agent/discovery/SystemRoot.h>
#include <agent/discovery/dmi/DmiValues.h>

#include <gtest/gtest.h>

namespace agent::discovery::test {
namespace {

TEST(BiosDate, BecomesMonthDayYearOfFullWidth) {
  EXPECT_EQ(parseBiosDate("12/31/2010"), "12/31/2010");
  EXPECT_EQ(parseBiosDate("3/9/2023"), "03/09/2023");
  EXPECT_EQ(parseBiosDate("02/29/2024"), "02/29/2024");
  EXPECT_EQ(parseBiosDate("02/29/2000"), "02/29/2000");
}

TEST(BiosDate, YearOfTwoDigitsIsOneOfThe1900s) {
  EXPECT_EQ(parseBiosDate("07/04/99"), "07/04/1999");
  EXPECT_EQ(parseBiosDate("07/04/05"), "07/04/1905");
}

TEST(BiosDate, OtherFormsAndDaysOfNoCalendarAreNone) {
  for (const char* text :
       {"",           "/",          "//",         "12/31",      "12/31/",     "12/31/201",   "12/31/20100",
        "2010-12-31", "31.12.2010", "13/01/2010", "00/01/2010", "01/00/2010", "01/32/2010",  "02/29/2023",
        "02/29/1900", "04/31/2010", "+1/01/2010", "1 /01/2010", "012/1/2010", "12/31/2010 ", "12/31/2010/1",
        "12/31/0000", "a2/31/2010", "12/-1/2010"}) {
    EXPECT_EQ(parseBiosDate(text), std::nullopt) << text;
  }
}

TEST(BiosReleaseText, IsTwoBytes) {
  const auto release = parseBiosRelease("5.17");
  ASSERT_TRUE(release);
  EXPECT_EQ(release->major, 5U);
  EXPECT_EQ(release->minor, 17U);
  EXPECT_FALSE(release->isAbsent());
  EXPECT_TRUE(parseBiosRelease("0.0"));
  EXPECT_TRUE(parseBiosRelease("255.254"));
  EXPECT_FALSE(parseBiosRelease("255.254")->isAbsent());
  EXPECT_TRUE(parseBiosRelease("255.255")->isAbsent());
}

TEST(BiosReleaseText, OtherFormsAreNone) {
  for (const char* text :
       {"", ".", "5", "5.", ".5", "5.17.1", "256.0", "0.256", "-1.0", "5.0x1", " 5.1", "5,17"}) {
    EXPECT_FALSE(parseBiosRelease(text)) << text;
  }
}

TEST(FirmwareDate, OfSmbiosAndOfIso8601BecomesMonthDayYear) {
  EXPECT_EQ(parseFirmwareDate("3/9/2023"), "03/09/2023");
  EXPECT_EQ(parseFirmwareDate("3/9/99"), "03/09/1999");
  for (const char* text : {"2022-04-11", "20220411", "2022-04-11T00:00:00Z", "2022-04-11T23:59:59.5+08:00",
                           "2022-04-11 12:00", "20220411T120000Z", "2022-04-11t01z"}) {
    EXPECT_EQ(parseFirmwareDate(text), "04/11/2022") << text;
  }
}

TEST(FirmwareDate, OtherFormsAndDaysOfNoCalendarAreNone) {
  for (const char* text : {"", "2021", "2021-05", "2021-5-15", "2021-02-29", "2021-13-01", "0000-00-00",
                           "2022041", "2022-04-11T", "2022-04-11Tz", "2022-04-11 noon", "2022-04-11x",
                           "15-05-2021", "2021/05/15", "2021-0515", "+021-05-15", "20220411-1"}) {
    EXPECT_EQ(parseFirmwareDate(text), std::nullopt) << text;
  }
}

TEST(MajorMinor, IsTwoNumbersOf32Bits) {
  const auto numbers = parseMajorMinor("31007.2");
  ASSERT_TRUE(numbers);
  EXPECT_EQ(numbers->major, 31007U);
  EXPECT_EQ(numbers->minor, 2U);
  EXPECT_EQ(parseMajorMinor("4294967295.0")->major, 0xffffffffU);
  for (const char* text :
       {"", "1", "1.", ".1", "1.2.3", "v1.2", "1.2a", "4294967296.0", "99999999999.0", "0x1.2"}) {
    EXPECT_FALSE(parseMajorMinor(text)) << text;
  }
}

TEST(UnsetText, IsZerosAndWhatStandsBetween) {
  EXPECT_TRUE(isUnset("00000000-0000-0000-0000-000000000000"));
  EXPECT_TRUE(isUnset("0000-00-00T00:00:00Z"));
  EXPECT_FALSE(isUnset("00000000-0000-0000-0000-000000000001"));
  EXPECT_FALSE(isUnset("-"));
  EXPECT_FALSE(isUnset(""));
}

constexpr const char* folder = "sys/class/dmi/id/";

TEST(DmiSource, WhatOnlyStandsInForAValueIsAbsentAndReported) {
  const Machine machine(R"(
    sys/class/dmi/id/bios_vendor = To be filled by O.E.M.
    sys/class/dmi/id/bios_version =   1.2.3  
    sys/class/dmi/id/bios_date = 2023-03-09
    sys/class/dmi/id/bios_release = 255.255
  )");
  const NodeTree tree = discoverAt(machine);
  EXPECT_EQ(shown(tree), "40 Computer System\n  3 BIOS 307=\"1.2.3\"\n");
  const auto vendor = reportOn(tree, "dmi", "bios_vendor");
  ASSERT_TRUE(vendor);
  EXPECT_EQ(vendor->reason, SourceReport::Reason::Absent);
  EXPECT_EQ(vendor->detail, "it says nothing: \"To be filled by O.E.M.\"");
  const auto date = reportOn(tree, "dmi", "bios_date");
  ASSERT_TRUE(date);
  EXPECT_EQ(date->reason, SourceReport::Reason::Unreadable);
  EXPECT_EQ(date->detail, "\"2023-03-09\" is no date of the form month/day/year");
  const auto release = reportOn(tree, "dmi", "bios_release");
  ASSERT_TRUE(release);
  EXPECT_EQ(release->reason, SourceReport::Reason::Absent);
}

TEST(DmiSource, MissingAttributesAreReportedOneByOne) {
  const Machine machine("sys/class/dmi/id/bios_version = 7");
  const NodeTree tree = discoverAt(machine);
  for (const char* name : {"bios_vendor", "bios_date", "bios_release"}) {
    const auto report = reportOn(tree, "dmi", std::string(folder) + name);
    ASSERT_TRUE(report) << name;
    EXPECT_EQ(report->reason, SourceReport::Reason::Absent);
  }
  EXPECT_FALSE(reportOn(tree, "dmi", "bios_version"));
}

TEST(DmiSource, WithNoValueAtAllThereIsNoFirmware) {
  const Machine machine("sys/class/dmi/id/bios_version = Not Specified");
  EXPECT_EQ(shown(discoverAt(machine)), "40 Computer System\n");
}

TEST(DmiSource, WithoutTablesTheAttributesTellOfTheEmbeddedControllerToo) {
  const Machine machine("sys/class/dmi/id/ec_firmware_release = 1.32");
  const NodeTree tree = discoverAt(machine);
  EXPECT_EQ(shown(tree),
            "40 Computer System\n"
            "  1000 Embedded Controller\n"
            "    3 Embedded Controller Firmware 104=1 107=32 307=\"1.32\"\n");
  const auto report = reportOn(tree, "dmi", "sys/firmware/dmi/tables");
  ASSERT_TRUE(report);
  EXPECT_EQ(report->reason, SourceReport::Reason::Absent);
}

TEST(DmiSource, AnEmbeddedControllerOf255And255IsNone) {
  const Machine machine("sys/class/dmi/id/ec_firmware_release = 255.255");
  EXPECT_EQ(shown(discoverAt(machine)), "40 Computer System\n");
}

TEST(DmiSource, AReleaseThatIsNoneIsUnreadable) {
  const Machine machine("sys/class/dmi/id/bios_release = five");
  const NodeTree tree = discoverAt(machine);
  const auto report = reportOn(tree, "dmi", "bios_release");
  ASSERT_TRUE(report);
  EXPECT_EQ(report->reason, SourceReport::Reason::Unreadable);
}

TEST(DmiSource, AnAttributeBeyondTheLimitIsUnreadable) {
  Machine machine("sys/class/dmi/id/bios_vendor = Corvane");
  machine.write(std::string(folder) + "bios_version", std::string(SystemRoot::attributeLimit + 1, '7'));
  const NodeTree tree = discoverAt(machine);
  EXPECT_EQ(shown(tree), "40 Computer System\n  3 BIOS 36=\"Corvane\"\n");
  const auto report = reportOn(tree, "dmi", "bios_version");
  ASSERT_TRUE(report);
  EXPECT_EQ(report->reason, SourceReport::Reason::Unreadable);
  EXPECT_EQ(report->detail, "File too large");
}

}  // namespace
}  // namespace agent::discovery::test
