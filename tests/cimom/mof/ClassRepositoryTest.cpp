#include "Compiled.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace {

using cimom::ClassRepository;
using cimom::SchemaClass;
using cimom::mof::Property;
using mof_test::compiled;
using testing::ElementsAre;

constexpr std::string_view family = R"(
[Abstract, Version("1"), Description("top")] class Top { string Id; [Description("of top"), MaxLen(64)] string Name; };
[Version("2")] class Middle : Top { [Key, Override("Id")] string Id; uint16 Numbers[] = {1}; uint32 Go(); };
class Low : MIDDLE { [Description("of low")] string NAME = "none"; uint32 Go(); };
class Other : Top { };
)";

std::vector<std::string> names(const std::vector<Property>& properties) {
  std::vector<std::string> result;
  for (const Property& each : properties)
    result.push_back(each.name);
  return result;
}

std::vector<std::string> names(const std::vector<const SchemaClass*>& classes) {
  std::vector<std::string> result;
  for (const SchemaClass* each : classes)
    result.push_back(each->name());
  return result;
}

TEST(ClassRepository, findsClassesWhateverTheirCase) {
  const ClassRepository classes = compiled(family);
  ASSERT_NE(classes.find("lOW"), nullptr);
  EXPECT_EQ(classes.find("lOW")->name(), "Low");
  EXPECT_EQ(classes.find("None"), nullptr);
  EXPECT_THAT(names(classes.all()), ElementsAre("Top", "Middle", "Low", "Other"));
}

TEST(ClassRepository, knowsAncestry) {
  const ClassRepository classes = compiled(family);
  EXPECT_TRUE(classes.isA("low", "TOP"));
  EXPECT_TRUE(classes.isA("Top", "Top"));
  EXPECT_FALSE(classes.isA("Top", "Low"));
  EXPECT_FALSE(classes.isA("Other", "Middle"));
  EXPECT_FALSE(classes.isA("None", "None"));
  EXPECT_THAT(names(ClassRepository::withSubclasses(*classes.find("Top"))),
              ElementsAre("Top", "Middle", "Other", "Low"));
}

TEST(ClassRepository, inheritsPropertiesInOrderAndPutsOverridesInTheirPlace) {
  const ClassRepository classes = compiled(family);
  const SchemaClass& low = *classes.find("Low");
  EXPECT_THAT(names(low.properties), ElementsAre("Id", "NAME", "Numbers"));
  const Property* name = low.property("name");
  ASSERT_NE(name, nullptr);
  EXPECT_EQ(name->origin, "Top");
  EXPECT_EQ(name->defaultValue, (cimom::mof::Value{false, {std::string("none")}}));
  EXPECT_EQ(cimom::mof::textOf(name->qualifiers, "Description"), "of low");
  EXPECT_NE(cimom::mof::findQualifier(name->qualifiers, "MaxLen"), nullptr);
  EXPECT_EQ(low.property("Numbers")->defaultValue, (cimom::mof::Value{true, {std::int64_t{1}}}));
}

TEST(ClassRepository, settlesKeysWhereTheyAreFirstDeclared) {
  const ClassRepository classes = compiled(family);
  EXPECT_TRUE(classes.find("Top")->keys().empty());
  ASSERT_EQ(classes.find("Low")->keys().size(), 1U);
  EXPECT_EQ(classes.find("Low")->keys().front()->name, "Id");
}

TEST(ClassRepository, inheritsQualifiersButNotTheRestrictedOnes) {
  const ClassRepository classes = compiled(family);
  const SchemaClass& low = *classes.find("Low");
  EXPECT_EQ(cimom::mof::textOf(low.qualifiers, "Description"), "top");
  EXPECT_EQ(cimom::mof::findQualifier(low.qualifiers, "Version"), nullptr);
  EXPECT_TRUE(classes.find("Top")->isAbstract());
  EXPECT_FALSE(low.isAbstract());
  EXPECT_EQ(cimom::mof::findQualifier(low.property("Id")->qualifiers, "Override"), nullptr);
}

TEST(ClassRepository, overridesMethods) {
  const ClassRepository classes = compiled(family);
  EXPECT_EQ(classes.find("Low")->methods.size(), 1U);
}

TEST(ClassRepository, givesAQualifierWithoutAValueItsDefault) {
  const ClassRepository classes = compiled("class A { [MaxLen] string x; [Values] string y; };");
  const SchemaClass& type = *classes.find("A");
  EXPECT_EQ(cimom::mof::findQualifier(type.property("x")->qualifiers, "MaxLen")->value,
            (cimom::mof::Value{false, {std::int64_t{8}}}));
  EXPECT_TRUE(cimom::mof::findQualifier(type.property("y")->qualifiers, "Values")->value.isNull());
}

TEST(ClassRepository, letsAnAssociationNarrowItsReferences) {
  const ClassRepository classes = compiled(R"(
class Thing { [Key] string Id; };
class Device : Thing {};
[Association] class Link { [Key] Thing REF One; [Key] Thing REF Two; };
[Association] class DeviceLink : Link { [Override("One")] Device REF One; };
)");
  const SchemaClass& link = *classes.find("DeviceLink");
  EXPECT_TRUE(link.isAssociation());
  EXPECT_EQ(link.property("One")->referenceClass, "Device");
  EXPECT_TRUE(link.property("One")->key);
  EXPECT_EQ(link.property("Two")->referenceClass, "Thing");
}

TEST(ClassRepository, keepsInstances) {
  const ClassRepository classes = compiled("class A { uint8 x; };\ninstance of a { X = 5; };");
  ASSERT_EQ(classes.instances().size(), 1U);
  EXPECT_EQ(classes.instances().front().values.front().second, (cimom::mof::Value{false, {std::int64_t{5}}}));
}

TEST(ClassRepository, isTheBrokersModel) {
  const ClassRepository classes = compiled(family);
  const cimom::ClassModel& model = classes;
  EXPECT_THAT(model.classNames(), ElementsAre("Top", "Middle", "Low", "Other"));
  const auto low = model.declaration("LOW");
  ASSERT_TRUE(low);
  EXPECT_EQ(low->name, "Low");
  EXPECT_EQ(low->superClass, "Middle");
  ASSERT_EQ(low->properties.size(), 3U);
  EXPECT_TRUE(low->properties[0].isKey);
  EXPECT_EQ(low->properties[2].type, CMPI_uint16A);
  EXPECT_EQ(model.declaration("None"), std::nullopt);
}

TEST(ClassRepository, keepsWhatWasDeclaredBeforeAnError) {
  ClassRepository classes = compiled("");
  EXPECT_THROW(classes.compileText("class A {}; class", "text.mof"), cimom::MofError);
  EXPECT_NE(classes.find("A"), nullptr);
}

}  // namespace
