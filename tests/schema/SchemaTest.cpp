// The schema as it is laid out for the object manager: it compiles, and has what the provider sets.
#include <tests/schema/Compiled.h>

#include <cimom/mof/Parser.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <iterator>
#include <set>
#include <string>
#include <string_view>
#include <variant>
#include <vector>

namespace {

using cimom::ClassRepository;
using cimom::SchemaClass;
using cimom::mof::Parser;
using cimom::mof::Property;
using testing::ElementsAre;

struct Expected {
  std::string_view name;
  CMPIType type;
  std::string_view origin;  ///< the class that introduces it
};

constexpr std::string_view element = "CIM_ManagedElement";
constexpr std::string_view managed = "CIM_ManagedSystemElement";
constexpr std::string_view software = "CIM_SoftwareIdentity";

// What the provider may set: the CIM schema's names and types, and BuildID, which CIM lacks.
constexpr Expected properties[] = {
    {"Caption", CMPI_string, element},
    {"Description", CMPI_string, element},
    {"ElementName", CMPI_string, element},
    {"InstallDate", CMPI_dateTime, managed},
    {"Name", CMPI_string, managed},
    {"OperationalStatus", CMPI_uint16A, managed},
    {"StatusDescriptions", CMPI_stringA, managed},
    {"HealthState", CMPI_uint16, managed},
    {"PrimaryStatus", CMPI_uint16, managed},
    {"DetailedStatus", CMPI_uint16, managed},
    {"OperatingStatus", CMPI_uint16, managed},
    {"CommunicationStatus", CMPI_uint16, managed},
    {"InstanceID", CMPI_string, element},
    {"MajorVersion", CMPI_uint16, software},
    {"MinorVersion", CMPI_uint16, software},
    {"RevisionNumber", CMPI_uint16, software},
    {"BuildNumber", CMPI_uint16, software},
    {"VersionString", CMPI_string, software},
    {"BuildID", CMPI_string, "KELVO_SoftwareIdentity"},
    {"TargetOperatingSystems", CMPI_stringA, software},
    {"Manufacturer", CMPI_string, software},
    {"Languages", CMPI_stringA, software},
    {"Classifications", CMPI_uint16A, software},
    {"ClassificationDescriptions", CMPI_stringA, software},
    {"SerialNumber", CMPI_string, software},
    {"TargetTypes", CMPI_stringA, software},
    {"IdentityInfoValue", CMPI_stringA, software},
    {"IdentityInfoType", CMPI_stringA, software},
    {"ReleaseDate", CMPI_dateTime, software},
    {"IsEntity", CMPI_boolean, software},
    {"ExtendedResourceType", CMPI_uint16, software},
    {"OtherExtendedResourceTypeDescription", CMPI_string, software},
    {"MinExtendedResourceTypeMajorVersion", CMPI_uint16, software},
    {"MinExtendedResourceTypeMinorVersion", CMPI_uint16, software},
    {"MinExtendedResourceTypeRevisionNumber", CMPI_uint16, software},
    {"MinExtendedResourceTypeBuildNumber", CMPI_uint16, software},
    {"TargetOSTypes", CMPI_uint16A, software},
};
static_assert(std::size(properties) == 37);

TEST(Schema, hasEveryPropertyWithItsType) {
  const ClassRepository classes = compiledSchema();
  const SchemaClass& identity = *classes.find("KELVO_SoftwareIdentity");
  for (const Expected& each : properties) {
    const Property* property = identity.property(each.name);
    ASSERT_NE(property, nullptr) << each.name;
    EXPECT_EQ(property->name, each.name);
    EXPECT_EQ(property->type, each.type) << each.name;
    EXPECT_EQ(property->origin, each.origin) << each.name;
    EXPECT_EQ(property->defaultValue, std::nullopt) << each.name;
  }
}

TEST(Schema, hasTheAncestryOfCim) {
  const ClassRepository classes = compiledSchema();
  std::vector<std::string> ancestry;
  for (const SchemaClass* each = classes.find("KELVO_SoftwareIdentity"); each != nullptr;
       each = each->superclass)
    ancestry.push_back(each->name());
  EXPECT_THAT(ancestry, ElementsAre("KELVO_SoftwareIdentity", "CIM_SoftwareIdentity", "CIM_LogicalElement",
                                    "CIM_ManagedSystemElement", "CIM_ManagedElement"));
}

TEST(Schema, makesTheInstanceIDTheOneKey) {
  const ClassRepository classes = compiledSchema();
  EXPECT_TRUE(classes.find("CIM_LogicalElement")->keys().empty());
  for (const char* name : {"CIM_SoftwareIdentity", "KELVO_SoftwareIdentity"}) {
    const auto keys = classes.find(name)->keys();
    ASSERT_EQ(keys.size(), 1U) << name;
    EXPECT_EQ(keys.front()->name, "InstanceID");
  }
}

TEST(Schema, saysWhichClassesHaveInstances) {
  const ClassRepository classes = compiledSchema();
  EXPECT_TRUE(classes.find("CIM_ManagedElement")->isAbstract());
  EXPECT_TRUE(classes.find("CIM_ManagedSystemElement")->isAbstract());
  EXPECT_TRUE(classes.find("CIM_LogicalElement")->isAbstract());
  EXPECT_FALSE(classes.find("CIM_SoftwareIdentity")->isAbstract());
  EXPECT_FALSE(classes.find("KELVO_SoftwareIdentity")->isAbstract());
}

TEST(Schema, describesItself) {
  const ClassRepository classes = compiledSchema();
  for (const SchemaClass* each : classes.all()) {
    EXPECT_NE(cimom::mof::textOf(each->declared.qualifiers, "Description"), "") << each->name();
    EXPECT_NE(cimom::mof::textOf(each->declared.qualifiers, "Version"), "") << each->name();
    for (const Property& property : each->declared.properties)
      EXPECT_NE(cimom::mof::textOf(property.qualifiers, "Description"), "")
          << each->name() << '.' << property.name;
  }
}

TEST(Schema, givesEachValueItsText) {
  const ClassRepository classes = compiledSchema();
  std::size_t mapped = 0;
  for (const SchemaClass* each : classes.all()) {
    for (const Property& property : each->declared.properties) {
      const auto* values = cimom::mof::findQualifier(property.qualifiers, "Values");
      const auto* map = cimom::mof::findQualifier(property.qualifiers, "ValueMap");
      ASSERT_EQ(values == nullptr, map == nullptr) << property.name;
      if (map == nullptr)
        continue;
      EXPECT_EQ(values->value.elements.size(), map->value.elements.size()) << property.name;
      ++mapped;
    }
  }
  EXPECT_GT(mapped, 0U);
}

// Object managers that have the whole of CIM compile these files alone.
TEST(Schema, redefinesNothingOfCim) {
  for (const char* name : {"KELVO_Endpoints.mof", "KELVO_SoftwareInventory.mof"}) {
    std::ifstream stream(schemaFolder() / name);
    const std::string text{std::istreambuf_iterator<char>(stream), std::istreambuf_iterator<char>()};
    Parser parser(text, name);
    std::size_t count = 0;
    for (auto next = parser.next(); !std::holds_alternative<cimom::mof::End>(next); next = parser.next()) {
      const auto* type = std::get_if<cimom::mof::Class>(&next);
      ASSERT_NE(type, nullptr) << name << " holds something else than classes";
      EXPECT_THAT(type->name, testing::StartsWith("KELVO_"));
      EXPECT_THAT(type->superclass, testing::StartsWith("CIM_"));
      ++count;
    }
    EXPECT_GT(count, 0U) << name;
  }
}

// Every character is one that any MOF compiler takes, whatever it thinks of UTF-8.
TEST(Schema, isPlainText) {
  std::size_t files = 0;
  for (const auto& entry : std::filesystem::recursive_directory_iterator(schemaFolder())) {
    if (entry.is_directory())
      continue;
    std::ifstream stream(entry.path());
    for (std::istreambuf_iterator<char> each(stream), end; each != end; ++each)
      ASSERT_TRUE((*each >= ' ' && *each <= '~') || *each == '\n') << entry.path();
    ++files;
  }
  EXPECT_GE(files, 13U);
}

}  // namespace
