#include "CapturedOutput.h"

#include <cli/CsvOutput.h>

#include <gtest/gtest.h>

namespace {

using cli::Scalar;
using cli::Value;

std::string csvOf(const cli::Columns& columns, const std::vector<cli::Row>& rows, bool forTerminal = false) {
  cli_test::CapturedOutput captured;
  cli::CsvOutput csv(columns, forTerminal, captured.output());
  for (const cli::Row& row : rows) {
    csv.write(row);
  }
  csv.finish();
  return captured.text();
}

TEST(CsvOutput, FieldsAreQuotedWhereTheyMustBe) {
  EXPECT_EQ(cli::csvField("plain"), "plain");
  EXPECT_EQ(cli::csvField("a,b"), "\"a,b\"");
  EXPECT_EQ(cli::csvField("say \"hi\""), "\"say \"\"hi\"\"\"");
  EXPECT_EQ(cli::csvField("two\nlines"), "\"two\nlines\"");
  EXPECT_EQ(cli::csvField("cr\r"), "\"cr\r\"");
  EXPECT_EQ(cli::csvField(" blank"), "\" blank\"");
  EXPECT_EQ(cli::csvField(""), "\"\"");
}

TEST(CsvOutput, LinesEndInCrLfAndTheFirstHasTheNames) {
  EXPECT_EQ(csvOf({{"A"}, {"B"}}, {{Scalar(std::string("x")), Scalar(std::uint64_t{7})}}), "A,B\r\nx,7\r\n");
}

TEST(CsvOutput, WithoutRowsThereAreTheNames) {
  EXPECT_EQ(csvOf({{"A"}, {"B"}}, {}), "A,B\r\n");
}

TEST(CsvOutput, NothingIsWrittenBeforeTheFirstRow) {
  cli_test::CapturedOutput captured;
  const cli::CsvOutput csv({{"A"}}, false, captured.output());
  EXPECT_EQ(captured.text(), "");
}

TEST(CsvOutput, NullAndEmptyAreToldApart) {
  EXPECT_EQ(csvOf({{"A"}, {"B"}}, {{Value(), Scalar(std::string())}}), "A,B\r\n,\"\"\r\n");
}

TEST(CsvOutput, ListsAreDividedBySemicolons) {
  const Value list = std::vector<Scalar>{std::string("a"), std::string("b,c"), std::monostate()};
  EXPECT_EQ(csvOf({{"A"}}, {{list}}), "A\r\n\"a;b,c;\"\r\n");
}

TEST(CsvOutput, ValuesAreAsInJson) {
  const cli::Row row{Scalar(cli::DateTime{"20101231000000.000000+000"}), Scalar(true),
                     Scalar(std::int64_t{-3}), Scalar(2.5), Scalar(cli::Reference{"root/cimv2:C.K=\"v\""})};
  EXPECT_EQ(csvOf({{"D"}, {"T"}, {"S"}, {"R"}, {"P"}}, {row}),
            "D,T,S,R,P\r\n20101231000000.000000+000,true,-3,2.5,\"root/cimv2:C.K=\"\"v\"\"\"\r\n");
}

TEST(CsvOutput, NumbersAreNotNamed) {
  EXPECT_EQ(csvOf({{"A", {{7, "seven"}}}}, {{Scalar(std::uint64_t{7})}}), "A\r\n7\r\n");
}

TEST(CsvOutput, ATerminalGetsNoControlCharacters) {
  EXPECT_EQ(csvOf({{"A"}}, {{Scalar(std::string("a\x1b[m"))}}, true), "A\r\na\xEF\xBF\xBD[m\r\n");
  EXPECT_EQ(csvOf({{"A"}}, {{Scalar(std::string("a\x1b[m"))}}, false), "A\r\na\x1b[m\r\n");
}

}  // namespace
