#include "Fixture.h"

namespace cimom::xml {
namespace {

using testing::ElementsAre;
using testing::HasSubstr;
using testing::Not;

class Instances : public XmlTest {
 protected:
  std::string written(const Instance& instance, InstanceOptions options = {}) {
    options.form = InstanceForm::instance;
    std::string out;
    InstanceWriter(schema.repository, std::move(options)).append(out, instance);
    EXPECT_EQ(dsp0203::firstViolation(response(out)), "") << out;
    return out;
  }
  /// The names of the properties that are shown, in their order.
  std::vector<std::string> shown(const Instance& instance, const InstanceOptions& options) {
    std::vector<std::string> names;
    const std::string out = written(instance, options);
    for (const PropertyElement& property : readInstance(out).properties)
      names.push_back(property.name);
    return names;
  }
};

TEST_F(Instances, WhatIsNotSetIsNull) {
  EXPECT_EQ(written(make("Base")),
            "<INSTANCE CLASSNAME=\"Base\"><PROPERTY NAME=\"Name\" TYPE=\"string\"></PROPERTY>"
            "<PROPERTY NAME=\"State\" TYPE=\"uint16\"></PROPERTY>"
            "<PROPERTY NAME=\"Caption\" TYPE=\"string\"></PROPERTY></INSTANCE>");
}

TEST_F(Instances, ValuesBetweenNulls) {
  Instance& base = make("Base");
  CMPIValue value{};
  value.uint16 = 7;
  set(base, "State", value, CMPI_uint16);
  EXPECT_EQ(written(base),
            "<INSTANCE CLASSNAME=\"Base\"><PROPERTY NAME=\"Name\" TYPE=\"string\"></PROPERTY>"
            "<PROPERTY NAME=\"State\" TYPE=\"uint16\"><VALUE>7</VALUE></PROPERTY>"
            "<PROPERTY NAME=\"Caption\" TYPE=\"string\"></PROPERTY></INSTANCE>");
}

TEST_F(Instances, EachPropertyAloneAndEachPropertyMissing) {
  for (const std::string only : {"Name", "Caption"}) {
    Instance& base = make("Base");
    setText(base, only, "x<");
    const InstanceElement read = readInstance(written(base));
    for (const PropertyElement& property : read.properties)
      if (property.name == only)
        EXPECT_EQ(std::get<std::string>(property.value), "x<");
      else
        EXPECT_TRUE(std::holds_alternative<std::monostate>(property.value)) << property.name;
  }
}

TEST_F(Instances, ExplicitNullIsNull) {
  Instance& base = make("Base");
  ASSERT_EQ(base.setProperty("Caption", nullptr, CMPI_string), CMPI_RC_OK);
  EXPECT_THAT(written(base), HasSubstr("<PROPERTY NAME=\"Caption\" TYPE=\"string\"></PROPERTY>"));
}

TEST_F(Instances, ArraysAndTheirNulls) {
  Instance& leaf = make("Leaf");
  Array* const words = Array::create(arena, 2, CMPI_string);
  CMPIValue element{};
  element.string = String::create(arena, "a&b");
  ASSERT_EQ(words->set(0, &element, CMPI_string), CMPI_RC_OK);
  CMPIValue value{};
  value.array = words;
  set(leaf, "Words", value, CMPI_stringA);
  const std::string out = written(leaf);
  EXPECT_THAT(out,
              HasSubstr("<PROPERTY.ARRAY NAME=\"Words\" TYPE=\"string\"><VALUE.ARRAY><VALUE>a&amp;b</VALUE>"
                        "<VALUE.NULL/></VALUE.ARRAY></PROPERTY.ARRAY>"));
  EXPECT_THAT(out, HasSubstr("<PROPERTY.ARRAY NAME=\"Bytes\" TYPE=\"uint8\"></PROPERTY.ARRAY>"));
}

TEST_F(Instances, EmbeddedObjectsAreMarked) {
  Instance& leaf = make("Leaf");
  setText(leaf, "Inner", "<INSTANCE CLASSNAME=\"Base\"/>");
  const std::string out = written(leaf);
  EXPECT_THAT(
      out,
      HasSubstr("<PROPERTY NAME=\"Inner\" TYPE=\"string\" EmbeddedObject=\"instance\"><VALUE>&lt;INSTANCE "
                "CLASSNAME=&quot;Base&quot;/&gt;</VALUE></PROPERTY>"));
  EXPECT_THAT(
      out,
      HasSubstr("<PROPERTY.ARRAY NAME=\"Any\" TYPE=\"string\" EmbeddedObject=\"object\"></PROPERTY.ARRAY>"));
}

TEST_F(Instances, References) {
  ObjectPath& left = path("Leaf");
  setText(left, "Name", "a");
  Instance& tie = make("Tie");
  CMPIValue value{};
  value.ref = &left;
  set(tie, "Left", value, CMPI_ref);
  const std::string out = written(tie);
  EXPECT_THAT(out, HasSubstr("<PROPERTY.REFERENCE NAME=\"Left\" REFERENCECLASS=\"Base\"><VALUE.REFERENCE>"
                             "<LOCALINSTANCEPATH>"));
  EXPECT_THAT(out,
              HasSubstr("<PROPERTY.REFERENCE NAME=\"Right\" REFERENCECLASS=\"Base\"></PROPERTY.REFERENCE>"));
}

TEST_F(Instances, TextThatXmlCannotCarryNeverBreaksTheDocument) {
  Instance& base = make("Base");
  std::string every;
  for (int byte = 0; byte < 256; ++byte)
    every += static_cast<char>(byte);
  setText(base, "Caption", every);
  const InstanceElement read = readInstance(written(base));
  EXPECT_THAT(std::get<std::string>(read.properties.at(2).value), HasSubstr("\t\n"));
  EXPECT_THAT(std::get<std::string>(read.properties.at(2).value), HasSubstr("\r"));
}

TEST_F(Instances, PropertyListIgnoresCaseAndWhatIsNoProperty) {
  InstanceOptions options;
  options.properties = {{"state", "NAME", "shoe"}};
  EXPECT_THAT(shown(make("Leaf"), options), ElementsAre("Name", "State"));
  options.properties = {{"State"}};
  EXPECT_THAT(shown(make("Leaf"), options), ElementsAre("State"));
  options.properties.emplace();
  EXPECT_THAT(shown(make("Leaf"), options), ElementsAre());
}

TEST_F(Instances, WithoutDeepInheritanceWhatTheRequestedClassHas) {
  InstanceOptions options;
  options.requested = &schemaOf("Base");
  EXPECT_EQ(shown(make("Leaf"), options).size(), schemaOf("Leaf").properties.size());
  options.deepInheritance = false;
  EXPECT_THAT(shown(make("Leaf"), options), ElementsAre("Name", "State", "Caption"));
}

TEST_F(Instances, LocalOnly) {
  InstanceOptions options;
  options.localOnly = true;
  EXPECT_THAT(shown(make("Leaf"), options),
              testing::AllOf(testing::Contains("Caption"), testing::Contains("U8"),
                             Not(testing::Contains("Name")), Not(testing::Contains("State"))));
  options.requested = &schemaOf("Leaf");
  EXPECT_THAT(shown(make("Leaf"), options), Not(testing::Contains("Name")));
  options.requested = &schemaOf("Base");
  EXPECT_EQ(shown(make("Leaf"), options).size(), schemaOf("Leaf").properties.size());
  options.deepInheritance = false;
  EXPECT_THAT(shown(make("Leaf"), options), ElementsAre("Name", "State", "Caption"));
}

TEST_F(Instances, ConditionsNarrowEachOther) {
  InstanceOptions options;
  options.requested = &schemaOf("Base");
  options.deepInheritance = false;
  options.properties = {{"Name", "U8"}};
  EXPECT_THAT(shown(make("Leaf"), options), ElementsAre("Name"));
}

TEST_F(Instances, ClassOrigin) {
  InstanceOptions options;
  options.includeClassOrigin = true;
  const std::string out = written(make("Leaf"), options);
  EXPECT_THAT(out, HasSubstr("NAME=\"State\" TYPE=\"uint16\" CLASSORIGIN=\"Base\""));
  EXPECT_THAT(out, HasSubstr("NAME=\"U8\" TYPE=\"uint8\" CLASSORIGIN=\"Leaf\""));
  EXPECT_THAT(
      out,
      HasSubstr("NAME=\"Caption\" TYPE=\"string\" CLASSORIGIN=\"Base\""));  // an override keeps its origin
  EXPECT_THAT(written(make("Leaf")), Not(HasSubstr("CLASSORIGIN")));
}

TEST_F(Instances, Qualifiers) {
  InstanceOptions options;
  options.includeQualifiers = true;
  Instance& leaf = make("Leaf");
  setText(leaf, "Caption", "c");
  const std::string out = written(leaf, options);
  EXPECT_THAT(out, HasSubstr("<INSTANCE CLASSNAME=\"Leaf\"><QUALIFIER NAME=\"Description\" TYPE=\"string\" "
                             "TRANSLATABLE=\"true\"><VALUE>a leaf</VALUE></QUALIFIER>"));
  EXPECT_THAT(
      out, HasSubstr("<QUALIFIER NAME=\"Values\" TYPE=\"string\" TRANSLATABLE=\"true\"><VALUE.ARRAY><VALUE>a"
                     "</VALUE><VALUE>b</VALUE></VALUE.ARRAY></QUALIFIER><VALUE>c</VALUE></PROPERTY>"));
  EXPECT_THAT(written(make("Leaf")), Not(HasSubstr("QUALIFIER")));
}

TEST_F(Instances, QualifiersOfNulls) {
  InstanceOptions options;
  options.includeQualifiers = true;
  EXPECT_THAT(written(make("Base"), options),
              HasSubstr("<VALUE>how it is</VALUE></QUALIFIER></PROPERTY><PROPERTY NAME=\"Caption\" "
                        "TYPE=\"string\"></PROPERTY>"
                        "</INSTANCE>"));
}

TEST_F(Instances, OneWriterForInstancesOfManyClasses) {
  InstanceOptions options;
  options.form = InstanceForm::instance;
  InstanceWriter writer(schema.repository, options);
  Instance& first = make("Leaf");
  setText(first, "Name", "a");
  Instance& second = make("Base");
  setText(second, "Name", "b");
  for (const Instance* const each : {&first, &second, &first, &first, &second}) {
    std::string out;
    writer.append(out, *each);
    EXPECT_EQ(out, written(*each));
  }
}

// The repository's classes keep an embedded instance as a text; this schema has one as an instance.
class WithInstances : public ClassModel {
  [[nodiscard]] std::vector<std::string> classNames() const override { return {"Outer"}; }
  [[nodiscard]] std::optional<ClassDeclaration> declaration(std::string_view /*className*/) const override {
    return ClassDeclaration{
        "Outer",
        "",
        {{"Id", CMPI_string, false}, {"Inner", CMPI_instance, false}, {"Inners", CMPI_instanceA, false}}};
  }
};

TEST_F(Instances, EmbeddedInstancesAreText) {
  const ClassTable table{WithInstances()};
  const auto outer = [&](const char* id) {
    Instance* const made = Instance::create(arena, *ObjectPath::create(arena, table, "root", "Outer"));
    setText(*made, "Id", id);
    return made;
  };
  Instance* const all = outer("1");
  CMPIValue value{};
  value.inst = outer("2 & 3");
  set(*all, "Inner", value, CMPI_instance);
  Array* const inners = Array::create(arena, 2, CMPI_instance);
  ASSERT_EQ(inners->set(1, &value, CMPI_instance), CMPI_RC_OK);
  value.array = inners;
  set(*all, "Inners", value, CMPI_instanceA);
  const InstanceElement read = readInstance(written(*all));
  ASSERT_EQ(read.properties.size(), 3U);
  EXPECT_EQ(read.properties[1].embedded, PropertyElement::Embedded::instance);
  const InstanceElement inner = readInstance(std::get<std::string>(read.properties[1].value));
  EXPECT_EQ(std::get<std::string>(inner.properties.at(0).value), "2 & 3");
  const auto& texts = std::get<std::vector<ValueText>>(read.properties[2].value);
  ASSERT_EQ(texts.size(), 2U);
  EXPECT_FALSE(texts[0]);
  EXPECT_EQ(readInstance(texts[1].value()).className, "Outer");
}

}  // namespace
}  // namespace cimom::xml
