#include <cli/DateText.h>

#include <gtest/gtest.h>

namespace {

TEST(DateText, MidnightIsADate) {
  EXPECT_EQ(cli::readableDate("20101231000000.000000+000"), "2010-12-31");
  EXPECT_EQ(cli::readableDate("20240229000000.000000-330"), "2024-02-29");
}

TEST(DateText, ATimeIsShownWithItsDistanceFromUtc) {
  EXPECT_EQ(cli::readableDate("20101231140506.000000+060"), "2010-12-31 14:05:06 +01:00");
  EXPECT_EQ(cli::readableDate("20101231140506.000000-330"), "2010-12-31 14:05:06 -05:30");
  EXPECT_EQ(cli::readableDate("20101231000000.000001+000"), "2010-12-31 00:00:00 +00:00");
}

TEST(DateText, WhatIsNoDateIsNothing) {
  EXPECT_EQ(cli::readableDate(""), std::nullopt);
  EXPECT_EQ(cli::readableDate("2010-12-31"), std::nullopt);
  EXPECT_EQ(cli::readableDate("00000012131415.000000:000"), std::nullopt);   // an interval
  EXPECT_EQ(cli::readableDate("   000000000000.000000+000"), std::nullopt);  // no field could be read
  EXPECT_EQ(cli::readableDate("20101331000000.000000+000"), std::nullopt);
  EXPECT_EQ(cli::readableDate("20230229000000.000000+000"), std::nullopt);
  EXPECT_EQ(cli::readableDate("2010123100****.******+000"), std::nullopt);
  EXPECT_EQ(cli::readableDate("20101231250000.000000+000"), std::nullopt);
  EXPECT_EQ(cli::readableDate("20101231006000.000000+000"), std::nullopt);
}

}  // namespace
