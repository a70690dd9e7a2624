// This system's classes on top of a full CIM schema, without the part of one that lies beside them.
#include <tests/schema/Compiled.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <fstream>
#include <iterator>
#include <string>
#include <vector>

namespace {

using cimom::ClassRepository;
using cimom::SchemaClass;
using cimom::mof::Property;
using testing::HasSubstr;
using testing::Not;
using testing::SizeIs;
using testing::UnorderedElementsAre;

std::string textOf(const std::filesystem::path& file) {
  std::ifstream stream(file);
  return {std::istreambuf_iterator<char>(stream), std::istreambuf_iterator<char>()};
}

/// The files that other object managers compile, in the order of their names, which is that of their needs.
std::vector<std::filesystem::path> ownFiles() {
  std::vector<std::filesystem::path> files;
  for (const auto& entry : std::filesystem::directory_iterator(schemaFolder())) {
    const std::string name = entry.path().filename();
    if (name.starts_with("KELVO_") && name.ends_with(".mof"))
      files.push_back(entry.path());
  }
  std::sort(files.begin(), files.end());
  return files;
}

class OnTheFullSchema : public testing::Test {
 protected:
  OnTheFullSchema() {
    classes.compileFile(FULL_SCHEMA);
    for (const SchemaClass* each : classes.all())
      cimClasses.push_back(each->name());
    for (const auto& file : ownFiles())
      classes.compileText(textOf(file), file.filename().string());  // a text may include nothing
    classes.checkReferences();
  }
  [[nodiscard]] std::vector<const SchemaClass*> own() const {
    std::vector<const SchemaClass*> found;
    std::copy_if(classes.all().begin(), classes.all().end(), std::back_inserter(found),
                 [](const SchemaClass* each) { return each->name().starts_with("KELVO_"); });
    return found;
  }

  ClassRepository classes;
  std::vector<std::string> cimClasses;
};

TEST_F(OnTheFullSchema, AllClassesCompileInTheOrderOfTheFiles) {
  EXPECT_THAT(ownFiles(), SizeIs(2));
  std::vector<std::string> names;
  for (const SchemaClass* each : own())
    names.push_back(each->name());
  EXPECT_THAT(names, UnorderedElementsAre("KELVO_SoftwareIdentity", "KELVO_InstalledSoftwareIdentity",
                                          "KELVO_BMCSoftwareIdentity", "KELVO_BIOSSoftwareIdentity",
                                          "KELVO_NetworkSoftwareIdentity", "KELVO_ComputerSystem",
                                          "KELVO_SPComputerSystem", "KELVO_NetworkPort"));
  EXPECT_EQ(classes.all().size(), cimClasses.size() + names.size()) << "nothing of CIM is declared again";
}

TEST_F(OnTheFullSchema, NothingIsPulledIn) {
  for (const auto& file : ownFiles())
    EXPECT_THAT(textOf(file), Not(HasSubstr("#pragma"))) << file;
}

TEST_F(OnTheFullSchema, EachClassHasAllThatItsSuperclassHas) {
  for (const SchemaClass* each : own()) {
    ASSERT_NE(each->superclass, nullptr) << each->name();
    EXPECT_THAT(each->superclass->name(), testing::StartsWith("CIM_"));
    for (const Property& property : each->superclass->properties) {
      const Property* inherited = each->property(property.name);
      ASSERT_NE(inherited, nullptr) << each->name() << '.' << property.name;
      EXPECT_EQ(inherited->type, property.type) << each->name() << '.' << property.name;
      EXPECT_EQ(inherited->key, property.key) << each->name() << '.' << property.name;
      EXPECT_EQ(inherited->origin, property.origin) << each->name() << '.' << property.name;
    }
    EXPECT_EQ(each->methods.size(), each->superclass->methods.size()) << each->name();
    EXPECT_EQ(each->isAssociation(), each->superclass->isAssociation()) << each->name();
  }
  EXPECT_NE(classes.find("KELVO_SoftwareIdentity")->property("LargeBuildNumber"), nullptr);
  EXPECT_NE(classes.find("KELVO_BMCSoftwareIdentity")->property("ElementSoftwareStatus"), nullptr);
}

// A property that a superclass has is declared again as an override or not at all; the full schema has more
// of them than the part beside this system's classes.
TEST_F(OnTheFullSchema, WhatIsDeclaredAgainIsAReferenceOfASubclass) {
  std::size_t overrides = 0;
  for (const SchemaClass* each : own()) {
    for (const Property& property : each->declared.properties) {
      const Property* above = each->superclass->property(property.name);
      if (above == nullptr)
        continue;
      ASSERT_TRUE(property.isReference() && above->isReference()) << each->name() << '.' << property.name;
      EXPECT_EQ(cimom::mof::textOf(property.qualifiers, "Override"), property.name) << each->name();
      EXPECT_TRUE(classes.isA(property.referenceClass, above->referenceClass))
          << each->name() << '.' << property.name;
      ++overrides;
    }
  }
  EXPECT_EQ(overrides, 6U);
}

TEST_F(OnTheFullSchema, EachClassSaysItsVersionInThreeNumbers) {
  for (const SchemaClass* each : own())
    EXPECT_THAT(std::string(cimom::mof::textOf(each->declared.qualifiers, "Version")),
                testing::MatchesRegex("[0-9]+[.][0-9]+[.][0-9]+"))
        << each->name();
}

// Compilers that know the qualifiers of the standard alone refuse any other.
TEST_F(OnTheFullSchema, QualifiersAreThoseOfTheStandard) {
  for (const SchemaClass* each : own()) {
    for (const auto& qualifier : each->declared.qualifiers)
      EXPECT_NE(classes.qualifier(qualifier.name), nullptr) << each->name() << ": " << qualifier.name;
    for (const Property& property : each->declared.properties)
      for (const auto& qualifier : property.qualifiers)
        EXPECT_NE(classes.qualifier(qualifier.name), nullptr) << property.name << ": " << qualifier.name;
  }
}

// The part of CIM beside this system's classes stands in for the whole: what both have is the same in both.
TEST_F(OnTheFullSchema, ThePartAgreesWithTheWhole) {
  const ClassRepository part = compiledSchema();
  std::size_t compared = 0;
  for (const std::string& name : cimClasses) {
    const SchemaClass* here = part.find(name);
    if (here == nullptr)
      continue;
    const SchemaClass& whole = *classes.find(name);
    EXPECT_EQ(here->declared.superclass, whole.declared.superclass) << name;
    EXPECT_EQ(here->isAbstract(), whole.isAbstract()) << name;
    EXPECT_EQ(cimom::mof::textOf(here->declared.qualifiers, "Version"),
              cimom::mof::textOf(whole.declared.qualifiers, "Version"))
        << name;
    for (const Property& property : here->properties) {
      const Property* there = whole.property(property.name);
      ASSERT_NE(there, nullptr) << name << '.' << property.name;
      EXPECT_EQ(there->type, property.type) << name << '.' << property.name;
      EXPECT_EQ(there->key, property.key) << name << '.' << property.name;
      EXPECT_EQ(there->referenceClass, property.referenceClass) << name << '.' << property.name;
      EXPECT_EQ(there->origin, property.origin) << name << '.' << property.name;
      ++compared;
    }
  }
  EXPECT_GT(compared, 200U);
}

}  // namespace
