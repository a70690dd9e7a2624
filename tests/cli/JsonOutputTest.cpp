#include "CapturedOutput.h"

#include <cli/JsonOutput.h>

#include <gtest/gtest.h>

#include <limits>

namespace {

using cli::Scalar;
using cli::Value;

std::string jsonOf(const cli::Columns& columns, const std::vector<cli::Row>& rows) {
  cli_test::CapturedOutput captured;
  cli::JsonOutput json(columns, captured.output());
  for (const cli::Row& row : rows) {
    json.write(row);
  }
  json.finish();
  return captured.text();
}

TEST(JsonOutput, WithoutRowsItIsAnEmptyList) {
  EXPECT_EQ(jsonOf({{"A"}}, {}), "[]\n");
}

TEST(JsonOutput, NothingIsWrittenBeforeTheFirstRow) {
  cli_test::CapturedOutput captured;
  const cli::JsonOutput json({{"A"}}, captured.output());
  EXPECT_EQ(captured.text(), "");
}

TEST(JsonOutput, ColumnsMayChangeFromObjectToObject) {
  cli_test::CapturedOutput captured;
  cli::JsonOutput json({{"A"}}, captured.output());
  json.write({Scalar(true)});
  json.use({{"B"}, {"C"}});
  json.write({Scalar(false), Scalar(std::string("x"))});
  json.finish();
  EXPECT_EQ(captured.text(), R"([
  {
    "A": true
  },
  {
    "B": false,
    "C": "x"
  }
]
)");
}

TEST(JsonOutput, MembersHaveTheOrderOfTheColumnsAndNullsAreLeftOut) {
  const std::vector<cli::Row> rows{{Scalar(std::uint64_t{1}), Value(), Scalar(std::string("x"))},
                                   {Value(), Value(), Scalar(std::string())}};
  EXPECT_EQ(jsonOf({{"Zeta"}, {"Alpha"}, {"Mid"}}, rows), R"([
  {
    "Zeta": 1,
    "Mid": "x"
  },
  {
    "Mid": ""
  }
]
)");
}

TEST(JsonOutput, EachTypeHasItsForm) {
  const cli::Row row{Scalar(true),
                     Scalar(std::uint64_t{18446744073709551615U}),
                     Scalar(std::int64_t{-5}),
                     Scalar(0.5),
                     Scalar(cli::DateTime{"20101231000000.000000+000"}),
                     Scalar(cli::Reference{"root/cimv2:C.K=\"1@a\""}),
                     std::vector<Scalar>{std::uint64_t{10}, std::monostate()},
                     std::vector<Scalar>{}};
  EXPECT_EQ(jsonOf({{"B"}, {"U"}, {"S"}, {"R"}, {"D"}, {"P"}, {"L"}, {"E"}}, {row}), R"([
  {
    "B": true,
    "U": 18446744073709551615,
    "S": -5,
    "R": 0.5,
    "D": "20101231000000.000000+000",
    "P": "root/cimv2:C.K=\"1@a\"",
    "L": [10, null],
    "E": []
  }
]
)");
}

TEST(JsonOutput, WhatIsNoNumberIsNoMember) {
  EXPECT_EQ(jsonOf({{"R"}}, {{Scalar(std::numeric_limits<double>::infinity())}}), "[\n  {}\n]\n");
}

TEST(JsonOutput, ControlCharactersAreEscaped) {
  EXPECT_EQ(jsonOf({{"A"}}, {{Scalar(std::string("\x1b[m\x7F\xC2\x9B\n"))}}),
            "[\n  {\n    \"A\": \"\\u001B[m\\u007f\\u009b\\n\"\n  }\n]\n");
}

TEST(JsonOutput, BytesThatAreNoUtf8AreReplaced) {
  EXPECT_EQ(jsonOf({{"A"}}, {{Scalar(std::string("\xFFö"))}}),
            "[\n  {\n    \"A\": \"\xEF\xBF\xBDö\"\n  }\n]\n");
}

}  // namespace
