#include "Fixture.h"

namespace cimom::xml {
namespace {

using testing::HasSubstr;
using testing::Not;

class Classes : public XmlTest {
 protected:
  std::string written(std::string_view name, const ClassOptions& options) {
    std::string out;
    appendClass(out, schema.repository, schemaOf(name), options);
    EXPECT_EQ(dsp0203::firstViolation(response(out)), "") << out;
    return out;
  }
};

ClassOptions all() {
  ClassOptions options;
  options.localOnly = false;
  options.includeClassOrigin = true;
  return options;
}
ClassOptions bare() {
  ClassOptions options;
  options.includeQualifiers = false;
  return options;
}

TEST_F(Classes, OnlyWhatItDeclares) {
  EXPECT_EQ(written("Single", bare()),
            "<CLASS NAME=\"Single\"><PROPERTY NAME=\"Id\" TYPE=\"uint16\"></PROPERTY></CLASS>");
  const std::string leaf = written("Leaf", bare());
  EXPECT_THAT(leaf,
              testing::StartsWith("<CLASS NAME=\"Leaf\" SUPERCLASS=\"Base\"><PROPERTY NAME=\"Caption\""));
  EXPECT_THAT(leaf, Not(HasSubstr("NAME=\"State\"")));
  EXPECT_THAT(leaf, Not(HasSubstr("PROPAGATED")));
  EXPECT_THAT(leaf, Not(HasSubstr("NAME=\"Start\"")));
  EXPECT_THAT(leaf, HasSubstr("<METHOD NAME=\"Stop\" TYPE=\"uint32\"><PARAMETER.REFARRAY NAME=\"Others\" "
                              "REFERENCECLASS=\"Base\"></PARAMETER.REFARRAY></METHOD></CLASS>"));
}

TEST_F(Classes, WithWhatItInherits) {
  const std::string leaf = written("Leaf", all());
  EXPECT_THAT(
      leaf, HasSubstr("<PROPERTY NAME=\"State\" TYPE=\"uint16\" CLASSORIGIN=\"Base\" PROPAGATED=\"true\">"));
  EXPECT_THAT(leaf, HasSubstr("<PROPERTY NAME=\"Caption\" TYPE=\"string\" CLASSORIGIN=\"Base\">"));
  EXPECT_THAT(leaf, HasSubstr("<PROPERTY NAME=\"U8\" TYPE=\"uint8\" CLASSORIGIN=\"Leaf\">"));
  EXPECT_THAT(leaf,
              HasSubstr("<METHOD NAME=\"Start\" TYPE=\"uint32\" CLASSORIGIN=\"Base\" PROPAGATED=\"true\">"));
}

TEST_F(Classes, PropertiesOfEveryKind) {
  const std::string leaf = written("Leaf", bare());
  EXPECT_THAT(leaf, HasSubstr("<PROPERTY.ARRAY NAME=\"Words\" TYPE=\"string\"></PROPERTY.ARRAY>"));
  EXPECT_THAT(leaf,
              HasSubstr("<PROPERTY.ARRAY NAME=\"Bytes\" TYPE=\"uint8\" ARRAYSIZE=\"4\"></PROPERTY.ARRAY>"));
  EXPECT_THAT(leaf, HasSubstr("<PROPERTY NAME=\"Inner\" TYPE=\"string\" EmbeddedObject=\"instance\">"));
  EXPECT_THAT(leaf, HasSubstr("<PROPERTY.ARRAY NAME=\"Any\" TYPE=\"string\" EmbeddedObject=\"object\">"));
  EXPECT_THAT(written("Tie", bare()),
              HasSubstr("<PROPERTY.REFERENCE NAME=\"Left\" REFERENCECLASS=\"Base\">"));
}

TEST_F(Classes, DefaultValues) {
  EXPECT_THAT(written("Base", bare()),
              HasSubstr("<PROPERTY NAME=\"State\" TYPE=\"uint16\"><VALUE>5</VALUE></PROPERTY>"));
}

TEST_F(Classes, QualifiersAndTheirFlavors) {
  ClassOptions options;
  const std::string base = written("Base", options);
  EXPECT_THAT(
      base,
      HasSubstr("<QUALIFIER NAME=\"Abstract\" TYPE=\"boolean\" TOSUBCLASS=\"false\"><VALUE>TRUE</VALUE>"));
  EXPECT_THAT(
      base, HasSubstr("<QUALIFIER NAME=\"Key\" TYPE=\"boolean\" OVERRIDABLE=\"false\"><VALUE>TRUE</VALUE>"));
  EXPECT_THAT(
      base, HasSubstr("<QUALIFIER NAME=\"Description\" TYPE=\"string\" TRANSLATABLE=\"true\"><VALUE>A thing "
                      "&lt;with&gt; &quot;marks&quot; &amp; more</VALUE></QUALIFIER>"));
  EXPECT_THAT(base, HasSubstr("<PARAMETER NAME=\"Seconds\" TYPE=\"uint32\"><QUALIFIER NAME=\"Description\""));
  EXPECT_THAT(written("Base", bare()), Not(HasSubstr("QUALIFIER")));
}

TEST_F(Classes, InheritedQualifiersArePropagated) {
  const std::string leaf = written("Leaf", all());
  EXPECT_THAT(leaf,
              HasSubstr("NAME=\"Name\" TYPE=\"string\" CLASSORIGIN=\"Base\" PROPAGATED=\"true\"><QUALIFIER "
                        "NAME=\"Key\" TYPE=\"boolean\" PROPAGATED=\"true\" OVERRIDABLE=\"false\">"));
  EXPECT_THAT(leaf,
              HasSubstr("<QUALIFIER NAME=\"Description\" TYPE=\"string\" TRANSLATABLE=\"true\"><VALUE>the "
                        "leaf's own words</VALUE></QUALIFIER>"));
}

TEST_F(Classes, ParametersOfEveryKind) {
  const std::string base = written("Base", bare());
  EXPECT_THAT(
      base, HasSubstr("<PARAMETER NAME=\"Seconds\" TYPE=\"uint32\"></PARAMETER>"
                      "<PARAMETER.ARRAY NAME=\"Words\" TYPE=\"string\"></PARAMETER.ARRAY>"
                      "<PARAMETER.REFERENCE NAME=\"Other\" REFERENCECLASS=\"Base\"></PARAMETER.REFERENCE>"));
}

TEST_F(Classes, PropertyList) {
  ClassOptions options = bare();
  options.properties = {{"u8", "shoe"}};
  const ClassElement read = std::get<ClassElement>(readParameterContent(written("Leaf", options)));
  ASSERT_EQ(read.properties.size(), 1U);
  EXPECT_EQ(read.properties[0].name, "U8");
  EXPECT_THAT(read.methods, testing::ElementsAre("Stop"));
  options.properties.emplace();
  EXPECT_TRUE(std::get<ClassElement>(readParameterContent(written("Leaf", options))).properties.empty());
}

TEST_F(Classes, EveryClassIsValidInEveryWay) {
  for (const SchemaClass* const each : schema.repository.all())
    for (const bool localOnly : {false, true})
      for (const bool includeQualifiers : {false, true})
        (void)written(each->name(), {localOnly, includeQualifiers, true, {}});
}

TEST_F(Classes, WithPath) {
  std::string out;
  appendClassWithPath(out, schema.repository, schemaOf("Single"), bare(), {"h", "root/cimv2"});
  EXPECT_THAT(out, testing::StartsWith("<VALUE.OBJECTWITHPATH><CLASSPATH><NAMESPACEPATH><HOST>h</HOST>"));
  EXPECT_THAT(out, HasSubstr("</CLASSPATH><CLASS NAME=\"Single\">"));
  EXPECT_EQ(dsp0203::firstViolation(response(out)), "");
}

}  // namespace
}  // namespace cimom::xml
