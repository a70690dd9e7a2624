#include "Fixture.h"

namespace cimom::xml {
namespace {

class InstanceForms : public XmlTest {
 protected:
  std::string written(InstanceForm form) {
    Instance& instance = make("Single");
    CMPIValue value{};
    value.uint16 = 5;
    set(instance, "Id", value, CMPI_uint16);
    InstanceOptions options;
    options.form = form;
    options.location = {"h", "n"};
    std::string out;
    InstanceWriter(schema.repository, options).append(out, instance);
    EXPECT_EQ(dsp0203::firstViolation(response(out + out)), "");
    return out;
  }
};

constexpr const char* name =
    "<INSTANCENAME CLASSNAME=\"Single\"><KEYBINDING NAME=\"Id\"><KEYVALUE VALUETYPE=\"numeric\" "
    "TYPE=\"uint16\">5"
    "</KEYVALUE></KEYBINDING></INSTANCENAME>";
constexpr const char* instance =
    "<INSTANCE CLASSNAME=\"Single\"><PROPERTY NAME=\"Id\" "
    "TYPE=\"uint16\"><VALUE>5</VALUE></PROPERTY></INSTANCE>";

std::string wholePath() {
  return std::string(
             "<INSTANCEPATH><NAMESPACEPATH><HOST>h</HOST><LOCALNAMESPACEPATH><NAMESPACE NAME=\"root\"/>"
             "<NAMESPACE NAME=\"cimv2\"/></LOCALNAMESPACEPATH></NAMESPACEPATH>") +
         name + "</INSTANCEPATH>";
}
std::string tagged(const std::string& tag, const std::string& content) {
  return "<" + tag + ">" + content + "</" + tag + ">";
}

TEST_F(InstanceForms, Alone) {
  EXPECT_EQ(written(InstanceForm::instance), instance);
}
TEST_F(InstanceForms, Named) {
  EXPECT_EQ(written(InstanceForm::namedInstance),
            tagged("VALUE.NAMEDINSTANCE", std::string(name) + instance));
}
TEST_F(InstanceForms, InstanceWithPath) {
  EXPECT_EQ(written(InstanceForm::instanceWithPath),
            tagged("VALUE.INSTANCEWITHPATH", wholePath() + instance));
}
TEST_F(InstanceForms, ObjectWithPath) {
  EXPECT_EQ(written(InstanceForm::objectWithPath), tagged("VALUE.OBJECTWITHPATH", wholePath() + instance));
}
TEST_F(InstanceForms, Object) {
  EXPECT_EQ(written(InstanceForm::object), tagged("VALUE.OBJECT", instance));
}

}  // namespace
}  // namespace cimom::xml
