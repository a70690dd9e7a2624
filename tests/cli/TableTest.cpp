#include "CapturedOutput.h"

#include <cli/Table.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <sstream>

namespace {

using cli::Charset;
using cli::Scalar;
using cli::TableStyle;
using cli::Value;

Value word(const char* value) {
  return Scalar(std::string(value));
}

std::string tableOf(const cli::Columns& columns, const TableStyle& style, const std::vector<cli::Row>& rows) {
  cli_test::CapturedOutput captured;
  cli::Table table(columns, style, captured.output());
  for (const cli::Row& row : rows) {
    table.write(row);
  }
  table.finish();
  return captured.text();
}

std::size_t widestLine(const std::string& text) {
  std::size_t widest = 0;
  std::istringstream lines(text);
  for (std::string line; std::getline(lines, line);) {
    widest = std::max(widest, cli::displayWidth(line));
  }
  return widest;
}

TEST(Table, ColumnsAreAsWideAsTheirWidestCell) {
  EXPECT_EQ(tableOf({{"ID"}, {"Text"}}, {}, {{word("1"), word("one")}, {word("1000"), word("x")}}),
            "ID    Text\n"
            "1     one\n"
            "1000  x\n");
}

TEST(Table, WidthsCountCellsNotBytes) {
  EXPECT_EQ(tableOf({{"A"}, {"B"}}, {}, {{word("東京"), word("x")}, {word("Möl"), word("y")}}),
            "A     B\n"
            "東京  x\n"
            "Möl   y\n");
}

TEST(Table, NoLineEndsInBlanks) {
  EXPECT_EQ(
      tableOf({{"A"}, {"B"}, {"C"}}, {}, {{word("1"), Value(), word("3")}, {word("1"), word("2"), Value()}}),
      "A  B  C\n"
      "1     3\n"
      "1  2\n");
}

TEST(Table, WithoutRowsNothingIsPrinted) {
  EXPECT_EQ(tableOf({{"A"}}, {}, {}), "");
}

TEST(Table, DatesAreDates) {
  EXPECT_EQ(tableOf({{"ReleaseDate"}}, {}, {{Scalar(cli::DateTime{"20101231000000.000000+000"})}}),
            "ReleaseDate\n2010-12-31\n");
}

TEST(Table, ADateThatIsNoneIsShownAsItIs) {
  EXPECT_EQ(tableOf({{"D"}}, {}, {{Scalar(cli::DateTime{"20100031000000.000000+000"})}}),
            "D\n20100031000000.000000+000\n");
}

TEST(Table, NumbersAreShownByWhatTheyStandFor) {
  const cli::Column column{"Classifications", {{10, "Firmware"}, {11, "BIOS/FCode"}}};
  EXPECT_EQ(cli::cellText(std::vector<Scalar>{std::uint64_t{10}, std::uint64_t{11}}, column, Charset::Utf8),
            "Firmware, BIOS/FCode");
  EXPECT_EQ(cli::cellText(Scalar(std::uint64_t{99}), column, Charset::Utf8), "99");
}

TEST(Table, ReferencesAreShownInShortWhereTheyHaveAShortForm) {
  EXPECT_EQ(cli::cellText(Scalar(cli::Reference{"root/cimv2:C.K=\"a\"", "C=a"}), {"Ref"}, Charset::Utf8),
            "C=a");
  EXPECT_EQ(
      cli::cellText(std::vector<Scalar>{cli::Reference{"n:C.K=\"a\"", "C=a"}, cli::Reference{"n:C.K=1"}},
                    {"Refs"}, Charset::Utf8),
      "C=a, C.K=1");
}

TEST(Table, ReferencesAreShownWithoutHostAndNamespace) {
  const cli::Column column{"Dependent"};
  EXPECT_EQ(
      cli::cellText(Scalar(cli::Reference{"//host:5988/root/cimv2:C.K=\"a:b\""}), column, Charset::Utf8),
      "C.K=\"a:b\"");
  EXPECT_EQ(cli::cellText(Scalar(cli::Reference{"C.N=1"}), column, Charset::Utf8), "C.N=1");
}

TEST(Table, ControlCharactersNeverComeThrough) {
  EXPECT_EQ(tableOf({{"A"}}, {}, {{word("x\x1b[2Jy")}}), "A\nx\xEF\xBF\xBD[2Jy\n");
}

TEST(Table, TheWidestColumnsGiveFirst) {
  const std::string text =
      tableOf({{"ID"}, {"Description"}, {"Version"}}, {40, Charset::Utf8},
              {{word("1@3b2"), word("A description that is much too long for this"), word("1.2.3")}});
  EXPECT_EQ(text,
            "ID     Description               Version\n"
            "1@3b2  A description that is m…  1.2.3\n");
  EXPECT_EQ(widestLine(text), 40U);
}

TEST(Table, WholeColumnsAreNeverCut) {
  const cli::Columns columns{{"InstanceID", {}, true}, {"Description"}};
  EXPECT_EQ(tableOf(columns, {44, Charset::Ascii},
                    {{word("1152921504606846976@abcdef"), word("A long description")}}),
            "InstanceID                  Description\n"
            "1152921504606846976@abcdef  A long descri...\n");
}

TEST(Table, ColumnsOfAHighRankGoFirst) {
  const cli::Columns columns{{"InstanceID", {}, true},
                             {"Description"},
                             {"Manufacturer", {}, false, 2},
                             {"ReleaseDate", {}, true, 1}};
  const std::vector<cli::Row> rows{{word("1@3b2"), word("Some description"), word("Example Systems"),
                                    Scalar(cli::DateTime{"20101231000000.000000+000"})}};
  EXPECT_EQ(tableOf(columns, {45, Charset::Utf8}, rows),
            "InstanceID  Description       ReleaseDate\n"
            "1@3b2       Some description  2010-12-31\n");
  EXPECT_EQ(tableOf(columns, {30, Charset::Utf8}, rows),
            "InstanceID  Description\n"
            "1@3b2       Some description\n");
}

TEST(Table, WhereNoTableFitsEachObjectIsABlock) {
  const std::vector<cli::Row> rows{{word("first value"), word("one two three four")}, {word("2"), Value()}};
  EXPECT_EQ(tableOf({{"First"}, {"Second"}}, {20, Charset::Utf8}, rows),
            "First   first value\n"
            "Second  one two\n"
            "        three four\n"
            "\n"
            "First   2\n");
}

TEST(Table, NoWidthNeverCuts) {
  const std::string longText(5000, 'x');
  EXPECT_EQ(tableOf({{"A"}}, {}, {{word(longText.c_str())}}), "A\n" + longText + "\n");
}

TEST(Table, NoLineIsEverWiderThanTheTerminal) {
  const cli::Columns columns{{"InstanceID", {}, true},
                             {"Description"},
                             {"VersionString"},
                             {"Manufacturer", {}, false, 2},
                             {"ReleaseDate", {}, true, 1},
                             {"Classifications", {}, false, 3}};
  const std::vector<cli::Row> rows{{word("1@0f"), word("A network device of 東京 with a long description"),
                                    word("6.1.0-18-amd64"), word("Exämple Systems Incorporated"),
                                    Scalar(cli::DateTime{"20101231000000.000000+000"}), word("Firmware")}};
  for (std::size_t width = 25; width < 160; ++width) {
    EXPECT_LE(widestLine(tableOf(columns, {width, Charset::Utf8}, rows)), width) << "at width " << width;
    EXPECT_LE(widestLine(tableOf(columns, {width, Charset::Ascii}, rows)), width) << "at width " << width;
  }
}

TEST(Table, EmptyColumnsAreDroppedWhereThatIsWanted) {
  const std::vector<cli::Row> rows{{word("1"), Value(), word("3")}};
  EXPECT_EQ(tableOf({{"A"}, {"B"}, {"C"}}, {0, Charset::Utf8, true}, rows), "A  C\n1  3\n");
  EXPECT_EQ(tableOf({{"A"}, {"B"}, {"C"}}, {0, Charset::Utf8, false}, rows), "A  B  C\n1     3\n");
}

TEST(Table, RecordsLeaveOutWhatHasNoValue) {
  EXPECT_EQ(tableOf({{"InstanceID"}, {"LongerNameThanThat"}, {"Name"}}, {0, Charset::Utf8, false, true},
                    {{word("1@3b2"), Value(), word("x")}}),
            "InstanceID  1@3b2\n"
            "Name        x\n");
}

}  // namespace
