#include "Fixture.h"

#include <cimom/xml/Conversion.h>
#include <cimom/xml/ValueWriter.h>

#include <cmath>
#include <limits>

namespace cimom::xml {
namespace {

class ValueWriter : public XmlTest {
 protected:
  static std::string written(const CMPIValue& value, CMPIType type) {
    CMPIData data{};
    data.type = type;
    data.value = value;
    std::string out;
    appendValueText(out, data);
    return out;
  }
  static std::string real64(double number) {
    CMPIValue value{};
    value.real64 = number;
    return written(value, CMPI_real64);
  }
  static std::string real32(float number) {
    CMPIValue value{};
    value.real32 = number;
    return written(value, CMPI_real32);
  }
  static std::string mof(const mof::Value& value, CMPIType type) {
    std::string out;
    appendMofValue(out, value, type);
    return out;
  }
};

TEST_F(ValueWriter, Integers) {
  CMPIValue value{};
  value.uint64 = std::numeric_limits<CMPIUint64>::max();
  EXPECT_EQ(written(value, CMPI_uint64), "18446744073709551615");
  EXPECT_EQ(written(value, CMPI_uint32), "4294967295");
  EXPECT_EQ(written(value, CMPI_uint16), "65535");
  EXPECT_EQ(written(value, CMPI_uint8), "255");
  EXPECT_EQ(written(value, CMPI_sint64), "-1");
  EXPECT_EQ(written(value, CMPI_sint32), "-1");
  EXPECT_EQ(written(value, CMPI_sint16), "-1");
  EXPECT_EQ(written(value, CMPI_sint8), "-1");
  value.sint64 = std::numeric_limits<CMPISint64>::min();
  EXPECT_EQ(written(value, CMPI_sint64), "-9223372036854775808");
}

TEST_F(ValueWriter, Booleans) {
  CMPIValue value{};
  EXPECT_EQ(written(value, CMPI_boolean), "FALSE");
  value.boolean = 1;
  EXPECT_EQ(written(value, CMPI_boolean), "TRUE");
}

TEST_F(ValueWriter, RealsHaveAPointAndEnoughDigits) {
  EXPECT_EQ(real64(1.5), "1.5000000000000000e+00");
  EXPECT_EQ(real64(0.1), "1.0000000000000001e-01");
  EXPECT_EQ(real64(-1e300), "-1.0000000000000001e+300");
  EXPECT_EQ(real32(0.1F), "1.00000001e-01");
  EXPECT_EQ(real64(0), "0.0000000000000000e+00");
}

TEST_F(ValueWriter, RealsReadAsTheSameNumber) {
  for (const double number : {1.0 / 3, 5e-324, std::numeric_limits<double>::max(), -2.5e-8})
    EXPECT_EQ(makeValue(arena, CMPI_real64, real64(number)).value.real64, number);
}

TEST_F(ValueWriter, RealsThatAreNoNumbers) {
  EXPECT_EQ(real64(std::nan("")), "NaN");
  EXPECT_EQ(real64(HUGE_VAL), "INF");
  EXPECT_EQ(real32(-HUGE_VALF), "-INF");
}

TEST_F(ValueWriter, Characters) {
  CMPIValue value{};
  value.char16 = u'&';
  EXPECT_EQ(written(value, CMPI_char16), "&amp;");
  value.char16 = 0x20ac;
  EXPECT_EQ(written(value, CMPI_char16), "\xe2\x82\xac");
  value.char16 = 0xd83d;
  EXPECT_EQ(written(value, CMPI_char16), "\xef\xbf\xbd");
}

TEST_F(ValueWriter, TextsAndTimes) {
  CMPIValue value{};
  value.string = String::create(arena, "a<b");
  EXPECT_EQ(written(value, CMPI_string), "a&lt;b");
  value.dateTime = DateTime::create(arena, std::string_view("20240131120000.000000+060"));
  EXPECT_EQ(written(value, CMPI_dateTime), "20240131120000.000000+060");
}

TEST_F(ValueWriter, Arrays) {
  std::string out;
  appendValueArray(out, makeArray(arena, CMPI_uint8, {ValueText("1"), std::nullopt, ValueText("3")}));
  EXPECT_EQ(out, "<VALUE.ARRAY><VALUE>1</VALUE><VALUE.NULL/><VALUE>3</VALUE></VALUE.ARRAY>");
  out.clear();
  appendValueArray(out, makeArray(arena, CMPI_string, {}));
  EXPECT_EQ(out, "<VALUE.ARRAY></VALUE.ARRAY>");
}

TEST_F(ValueWriter, ValuesOfMof) {
  EXPECT_EQ(mof({false, {std::monostate()}}, CMPI_string), "");
  EXPECT_EQ(mof({false, {true}}, CMPI_boolean), "<VALUE>TRUE</VALUE>");
  EXPECT_EQ(mof({false, {std::int64_t{-5}}}, CMPI_sint8), "<VALUE>-5</VALUE>");
  EXPECT_EQ(mof({false, {std::uint64_t{18446744073709551615U}}}, CMPI_uint64),
            "<VALUE>18446744073709551615</VALUE>");
  EXPECT_EQ(mof({false, {std::int64_t{2}}}, CMPI_real32), "<VALUE>2.00000000e+00</VALUE>");
  EXPECT_EQ(mof({false, {0.5}}, CMPI_real64), "<VALUE>5.0000000000000000e-01</VALUE>");
  EXPECT_EQ(mof({false, {CMPIChar16{u'<'}}}, CMPI_char16), "<VALUE>&lt;</VALUE>");
  EXPECT_EQ(mof({true, {std::string("a&b"), std::monostate()}}, CMPI_stringA),
            "<VALUE.ARRAY><VALUE>a&amp;b</VALUE><VALUE.NULL/></VALUE.ARRAY>");
}

}  // namespace
}  // namespace cimom::xml
