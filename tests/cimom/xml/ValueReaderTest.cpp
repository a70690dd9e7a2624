#include "Fixture.h"

#include <cimom/broker/Describe.h>
#include <cimom/xml/Conversion.h>

#include <cmath>

namespace cimom::xml {
namespace {

class ValueReader : public XmlTest {
 protected:
  CMPIData read(CMPIType type, const char* text) { return makeValue(arena, type, std::string(text)); }
  std::string described(CMPIType type, const char* text) { return describe(read(type, text)); }
  bool refuses(CMPIType type, const char* text) {
    try {
      (void)read(type, text);
    } catch (const ConversionError& error) {
      return error.code() == CMPI_RC_ERR_INVALID_PARAMETER;
    }
    return false;
  }
};

TEST_F(ValueReader, IntegersAtTheirLimits) {
  EXPECT_EQ(read(CMPI_uint8, "255").value.uint8, 255);
  EXPECT_EQ(read(CMPI_sint8, "-128").value.sint8, -128);
  EXPECT_EQ(read(CMPI_uint16, "65535").value.uint16, 65535);
  EXPECT_EQ(read(CMPI_sint16, "-32768").value.sint16, -32768);
  EXPECT_EQ(read(CMPI_uint32, "4294967295").value.uint32, 4294967295U);
  EXPECT_EQ(read(CMPI_sint32, "-2147483648").value.sint32, -2147483647 - 1);
  EXPECT_EQ(read(CMPI_uint64, "18446744073709551615").value.uint64, 18446744073709551615U);
  EXPECT_EQ(read(CMPI_sint64, "-9223372036854775808").value.sint64, -9223372036854775807LL - 1);
  EXPECT_EQ(read(CMPI_sint64, "9223372036854775807").type, CMPI_sint64);
}

TEST_F(ValueReader, IntegersBeyondTheirLimits) {
  EXPECT_TRUE(refuses(CMPI_uint8, "256"));
  EXPECT_TRUE(refuses(CMPI_uint8, "-1"));
  EXPECT_TRUE(refuses(CMPI_sint8, "128"));
  EXPECT_TRUE(refuses(CMPI_sint8, "-129"));
  EXPECT_TRUE(refuses(CMPI_uint16, "65536"));
  EXPECT_TRUE(refuses(CMPI_uint32, "4294967296"));
  EXPECT_TRUE(refuses(CMPI_sint32, "2147483648"));
  EXPECT_TRUE(refuses(CMPI_uint64, "18446744073709551616"));
  EXPECT_TRUE(refuses(CMPI_sint64, "9223372036854775808"));
  EXPECT_TRUE(refuses(CMPI_sint64, "-9223372036854775809"));
}

TEST_F(ValueReader, IntegersInOtherWays) {
  EXPECT_EQ(read(CMPI_uint16, "0xfF").value.uint16, 255);
  EXPECT_EQ(read(CMPI_sint16, "-0X10").value.sint16, -16);
  EXPECT_EQ(read(CMPI_uint8, "101b").value.uint8, 5);
  EXPECT_EQ(read(CMPI_uint8, "+7").value.uint8, 7);
  EXPECT_EQ(read(CMPI_uint8, "-0").value.uint8, 0);
  EXPECT_EQ(read(CMPI_uint8, "007").value.uint8, 7);
  EXPECT_EQ(read(CMPI_uint8, " \n7\t").value.uint8, 7);
}

TEST_F(ValueReader, WhatIsNoInteger) {
  for (const char* const text :
       {"", " ", "-", "+-1", "--1", "1.0", "1e3", "0x", "0xg", "b", "12b", "1 2", "one", "1x"})
    EXPECT_TRUE(refuses(CMPI_uint32, text)) << text;
}

TEST_F(ValueReader, Booleans) {
  EXPECT_EQ(read(CMPI_boolean, "TRUE").value.boolean, 1);
  EXPECT_EQ(read(CMPI_boolean, "true").value.boolean, 1);
  EXPECT_EQ(read(CMPI_boolean, " False ").value.boolean, 0);
  EXPECT_TRUE(refuses(CMPI_boolean, "1"));
  EXPECT_TRUE(refuses(CMPI_boolean, ""));
  EXPECT_TRUE(refuses(CMPI_boolean, "truee"));
}

TEST_F(ValueReader, Reals) {
  EXPECT_EQ(read(CMPI_real64, "-1.5e-3").value.real64, -1.5e-3);
  EXPECT_EQ(read(CMPI_real64, "+2").value.real64, 2);
  EXPECT_EQ(read(CMPI_real32, ".25").value.real32, 0.25F);
  EXPECT_TRUE(std::isnan(read(CMPI_real32, "NaN").value.real32));
  EXPECT_EQ(read(CMPI_real64, "INF").value.real64, HUGE_VAL);
  EXPECT_EQ(read(CMPI_real64, "-INF").value.real64, -HUGE_VAL);
  EXPECT_TRUE(refuses(CMPI_real64, "1e400"));
  EXPECT_TRUE(refuses(CMPI_real32, "1e40"));
  EXPECT_TRUE(refuses(CMPI_real64, "1,5"));
  EXPECT_TRUE(refuses(CMPI_real64, ""));
}

TEST_F(ValueReader, Characters) {
  EXPECT_EQ(read(CMPI_char16, "a").value.char16, u'a');
  EXPECT_EQ(read(CMPI_char16, " ").value.char16, u' ');
  EXPECT_EQ(read(CMPI_char16, "\xc3\xa9").value.char16, 0xe9);
  EXPECT_EQ(read(CMPI_char16, "\xe2\x82\xac").value.char16, 0x20ac);
  EXPECT_TRUE(refuses(CMPI_char16, ""));
  EXPECT_TRUE(refuses(CMPI_char16, "ab"));
  EXPECT_TRUE(refuses(CMPI_char16, "\xf0\x9f\x98\x80"));  // beyond the basic plane
}

TEST_F(ValueReader, DateTimes) {
  EXPECT_EQ(dateTimeText(read(CMPI_dateTime, "20240131120000.000000+060")), "20240131120000.000000+060");
  EXPECT_EQ(dateTimeText(read(CMPI_dateTime, "\n00000001000000.000000:000 ")), "00000001000000.000000:000");
  EXPECT_TRUE(refuses(CMPI_dateTime, "2024-01-31"));
  EXPECT_TRUE(refuses(CMPI_dateTime, "20241331120000.000000+060"));
}

TEST_F(ValueReader, StringsKeepTheirBlanks) {
  EXPECT_EQ(text(read(CMPI_string, " a\n")), " a\n");
  EXPECT_EQ(text(read(CMPI_string, "")), "");
}

TEST_F(ValueReader, NullKeepsItsType) {
  const CMPIData data = makeValue(arena, CMPI_uint16, std::nullopt);
  EXPECT_TRUE(isNull(data));
  EXPECT_EQ(data.type, CMPI_uint16);
}

TEST_F(ValueReader, Arrays) {
  const CMPIData data = makeArray(arena, CMPI_uint8, {ValueText("1"), std::nullopt, ValueText("0x10")});
  EXPECT_EQ(data.type, CMPI_uint8A);
  const auto all = elements(data);
  ASSERT_EQ(all.size(), 3U);
  EXPECT_EQ(all[0].value.uint8, 1);
  EXPECT_TRUE(isNull(all[1]));
  EXPECT_EQ(all[2].value.uint8, 16);
  EXPECT_EQ(elements(makeArray(arena, CMPI_string, {})).size(), 0U);
  EXPECT_THROW((void)makeArray(arena, CMPI_uint8, {ValueText("x")}), ConversionError);
}

TEST_F(ValueReader, ParametersOfOperations) {
  EXPECT_EQ(booleanOf("True"), true);
  EXPECT_EQ(booleanOf(" FALSE\n"), false);
  EXPECT_EQ(booleanOf("no"), std::nullopt);
  EXPECT_EQ(uint32Of("100"), 100U);
  EXPECT_EQ(uint32Of("0x10"), 16U);
  EXPECT_EQ(uint32Of("4294967296"), std::nullopt);
  EXPECT_EQ(uint32Of("-1"), std::nullopt);
  EXPECT_EQ(uint32Of(""), std::nullopt);
}

TEST_F(ValueReader, ErrorsNameTextAndType) {
  try {
    (void)read(CMPI_uint16, "many");
    FAIL();
  } catch (const ConversionError& error) {
    EXPECT_STREQ(error.what(), "\"many\" is no uint16");
  }
}

}  // namespace
}  // namespace cimom::xml
