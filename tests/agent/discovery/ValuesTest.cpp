#include <agent/discovery/Values.h>

#include <gtest/gtest.h>

namespace agent::discovery {
namespace {

TEST(Meaningful, IsTheTextWithoutBlanksAround) {
  EXPECT_EQ(meaningful("1.2\n"), "1.2");
  EXPECT_EQ(meaningful("  U41 v2.66  \n"), "U41 v2.66");
  EXPECT_EQ(meaningful("0"), "0");
  EXPECT_EQ(meaningful("Unknown Horizons 3"), "Unknown Horizons 3");
}

TEST(Meaningful, StandInsAreAbsentInAnyCase) {
  for (const char* text :
       {"", " \n", "N/A", "n/a", " N/A ", "NA", "None", "Unknown", "Not Specified", "Not Available",
        "Default string", "To be filled by O.E.M.", "To Be Filled By O.E.M. by More String",
        "TO BE FILLED BY O.E.M.", "(none)", "Undefined", "Not Applicable", "Not Present"}) {
    EXPECT_EQ(meaningful(text), std::nullopt) << text;
  }
}

TEST(ParseNumber, ReadsDecimalAndHexadecimal) {
  EXPECT_EQ(parseNumber("0\n"), 0U);
  EXPECT_EQ(parseNumber(" 42 "), 42U);
  EXPECT_EQ(parseNumber("0x1f\n"), 31U);
  EXPECT_EQ(parseNumber("4294967295"), 0xffffffffU);
  EXPECT_EQ(parseNumber("16", 16), 16U);
}

TEST(ParseNumber, AnythingElseIsNone) {
  for (const char* text :
       {"", " ", "-1", "+1", "1 2", "0x", "x1", "1x", "4294967296", "99999999999999999999"}) {
    EXPECT_EQ(parseNumber(text), std::nullopt) << text;
  }
  EXPECT_EQ(parseNumber("17", 16), std::nullopt);
}

TEST(ZeroVersion, IsNothingButZerosAndWhatStandsBetween) {
  for (const char* text : {"0", "00.00.00.00", "0.0", "0x0", "0x00000000", "0:0"}) {
    EXPECT_TRUE(isZeroVersion(text)) << text;
  }
  for (const char* text : {"", ".", "00.00.01.00", "1", "0a", "v0"}) {
    EXPECT_FALSE(isZeroVersion(text)) << text;
  }
}

TEST(JoinNames, CountsWhatIsTooMuch) {
  EXPECT_EQ(joinNames({}, 10), "");
  EXPECT_EQ(joinNames({"a"}, 10), "a");
  EXPECT_EQ(joinNames({"a", "b"}, 10), "a, b");
  EXPECT_EQ(joinNames({"abcd", "efgh", "i"}, 6), "abcd and 2 more");
  EXPECT_EQ(joinNames({"longer than that", "b"}, 6), "longer than that and 1 more");
}

}  // namespace
}  // namespace agent::discovery
