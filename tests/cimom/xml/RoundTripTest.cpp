#include "Fixture.h"

#include <cimom/broker/WbemUri.h>
#include <cimom/xml/Conversion.h>

#include <limits>

namespace cimom::xml {
namespace {

class RoundTrip : public XmlTest {
 protected:
  Instance& again(const Instance& instance) {
    std::string out;
    InstanceWriter(schema.repository, {}).append(out, instance);
    const auto element = std::get<InstanceElement>(readParameterContent(out));
    return *makeInstance(arena, classes, element, instance.path().nameSpace());
  }

  Instance& full() {
    Instance& leaf = make("Leaf");
    setText(leaf, "Name", " a \"b\" <c> & \xc3\xa9\r\n ");
    setText(leaf, "Caption", "");
    const auto put = [&](std::string_view name, CMPIType type, const char* written) {
      set(leaf, name, makeValue(arena, type, std::string(written)).value, type);
    };
    put("State", CMPI_uint16, "65535");
    put("Flag", CMPI_boolean, "true");
    put("Letter", CMPI_char16, "\xe2\x82\xac");
    put("When", CMPI_dateTime, "20240131120000.000000-300");
    put("Small", CMPI_real32, "0.1");
    put("Large", CMPI_real64, "-1.7976931348623157e308");
    put("U8", CMPI_uint8, "0");
    put("S8", CMPI_sint8, "-128");
    put("S16", CMPI_sint16, "-1");
    put("U32", CMPI_uint32, "4294967295");
    put("S32", CMPI_sint32, "-2147483648");
    put("U64", CMPI_uint64, "18446744073709551615");
    put("S64", CMPI_sint64, "-9223372036854775808");
    set(leaf, "Bytes", makeArray(arena, CMPI_uint8, {ValueText("1"), std::nullopt}).value, CMPI_uint8A);
    set(leaf, "Words", makeArray(arena, CMPI_string, {}).value, CMPI_stringA);
    return leaf;
  }
};

TEST_F(RoundTrip, EveryTypeComesBackAsItWas) {
  const Instance& before = full();
  const Instance& after = again(before);
  EXPECT_TRUE(samePath(before.path(), after.path()));
  for (const NamedValue& property : before.properties()) {
    ASSERT_NE(after.find(property.name), nullptr) << property.name;
    EXPECT_TRUE(sameValue(property.data, after.find(property.name)->data)) << property.name;
  }
  ASSERT_NE(after.find("Flags"), nullptr);
  EXPECT_TRUE(isNull(after.find("Flags")->data));
}

TEST_F(RoundTrip, References) {
  ObjectPath& left = path("Leaf");
  setText(left, "Name", "a");
  ObjectPath& right = path("Leaf", "root/other");
  right.setHostName("server");
  setText(right, "Name", "b");
  Instance& tie = make("Tie");
  CMPIValue value{};
  value.ref = &left;
  set(tie, "Left", value, CMPI_ref);
  value.ref = &right;
  set(tie, "Right", value, CMPI_ref);
  const Instance& after = again(tie);
  EXPECT_EQ(formatWbemUri(after.path()), formatWbemUri(tie.path()));
}

TEST_F(RoundTrip, PathsInEveryForm) {
  ObjectPath& leaf = path("Leaf");
  setText(leaf, "Name", "a & b");
  for (const PathForm form : {PathForm::instanceName, PathForm::valueReference}) {
    std::string out;
    PathWriter(form).append(out, leaf);
    const auto name = std::get<ObjectName>(readParameterContent(out));
    EXPECT_EQ(formatWbemUri(*makePath(arena, classes, name, "root/cimv2")), formatWbemUri(leaf));
  }
}

}  // namespace
}  // namespace cimom::xml
