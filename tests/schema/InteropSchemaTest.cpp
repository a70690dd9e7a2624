// What the interop namespace is made of, as clients know it from the CIM schema; and the profile, served by
// an object manager that knows of no profile and of a provider for nothing.
#include <tests/schema/Compiled.h>

#include <cimom/ObjectManager.h>
#include <cimom/broker/WbemUri.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace {

using cimom::ClassRepository;
using cimom::SchemaClass;
using cimom::mof::Property;
using testing::ElementsAre;

const ClassRepository& interopSchema() {
  static const ClassRepository classes = [] {
    ClassRepository result;
    result.compileFile(schemaFolder() / "CIM_Interop.mof");
    result.checkReferences();
    return result;
  }();
  return classes;
}

/// "CIM_A CIM_B CIM_C", from the class up.
std::string ancestry(const std::string& name) {
  std::string names;
  for (const SchemaClass* each = interopSchema().find(name); each != nullptr; each = each->superclass)
    names += (names.empty() ? "" : " ") + each->name();
  return names;
}

/// The properties that have the qualifier.
std::vector<std::string> having(const std::string& name, const std::string& qualifier) {
  std::vector<std::string> names;
  for (const Property& each : interopSchema().find(name)->properties) {
    if (cimom::mof::isTrue(each.qualifiers, qualifier))
      names.push_back(each.name);
  }
  return names;
}

CMPIType typeOf(const std::string& name, const char* property) {
  const Property* found = interopSchema().find(name)->property(property);
  return found == nullptr ? CMPI_null : found->type;
}

TEST(InteropSchema, hasTheClassesWithTheirAncestors) {
  EXPECT_EQ(ancestry("CIM_ObjectManager"),
            "CIM_ObjectManager CIM_WBEMService CIM_Service CIM_EnabledLogicalElement CIM_LogicalElement "
            "CIM_ManagedSystemElement CIM_ManagedElement");
  EXPECT_EQ(ancestry("CIM_Namespace"), "CIM_Namespace CIM_ManagedElement");
  EXPECT_EQ(ancestry("CIM_RegisteredProfile"),
            "CIM_RegisteredProfile CIM_RegisteredSpecification CIM_ManagedElement");
  EXPECT_EQ(ancestry("CIM_ElementConformsToProfile"), "CIM_ElementConformsToProfile");
}

TEST(InteropSchema, hasTheirKeys) {
  EXPECT_THAT(having("CIM_ObjectManager", "Key"),
              ElementsAre("Name", "SystemCreationClassName", "SystemName", "CreationClassName"));
  EXPECT_THAT(having("CIM_Namespace", "Key"),
              ElementsAre("SystemCreationClassName", "SystemName", "ObjectManagerCreationClassName",
                          "ObjectManagerName", "CreationClassName", "Name"));
  EXPECT_THAT(having("CIM_RegisteredProfile", "Key"), ElementsAre("InstanceID"));
  EXPECT_THAT(having("CIM_ElementConformsToProfile", "Key"),
              ElementsAre("ConformantStandard", "ManagedElement"));
  EXPECT_TRUE(interopSchema().find("CIM_ElementConformsToProfile")->isAssociation());
}

TEST(InteropSchema, hasTheirPropertiesWithTheirTypes) {
  EXPECT_THAT(having("CIM_ObjectManager", "Required"),
              ElementsAre("Description", "ElementName", "OperationalStatus", "Started"));
  EXPECT_EQ(typeOf("CIM_ObjectManager", "OperationalStatus"), CMPI_uint16A);
  EXPECT_EQ(typeOf("CIM_ObjectManager", "Started"), CMPI_boolean);
  EXPECT_EQ(typeOf("CIM_ObjectManager", "GatherStatisticalData"), CMPI_boolean);
  EXPECT_EQ(typeOf("CIM_RegisteredProfile", "RegisteredOrganization"), CMPI_uint16);
  EXPECT_EQ(typeOf("CIM_RegisteredProfile", "AdvertiseTypes"), CMPI_uint16A);
  EXPECT_EQ(typeOf("CIM_RegisteredProfile", "RegisteredVersion"), CMPI_string);
  EXPECT_EQ(interopSchema().find("CIM_ElementConformsToProfile")->property("ManagedElement")->referenceClass,
            "CIM_ManagedElement");
}

cimom::Configuration servedSchema() {
  cimom::Configuration result;
  for (const char* file :
       {"CIM_Core.mof", "CIM_Device.mof", "CIM_Interop.mof", "CIM_Software.mof", "CIM_System.mof",
        "KELVO_Endpoints.mof", "KELVO_SoftwareInventory.mof", "interop.mof"})
    result.schema.push_back(schemaFolder() / file);
  result.interop.emplace();
  return result;
}

TEST(InteropSchema, declaresTheSoftwareInventoryProfile) {
  cimom::ObjectManager manager(servedSchema());
  std::vector<std::string> texts;
  const auto sink = [&texts](const cimom::Instance& instance) {
    for (const char* name : {"InstanceID", "RegisteredName", "RegisteredVersion"})
      texts.emplace_back(cimom::text(instance.find(name)->data).value_or("none"));
    EXPECT_EQ(instance.find("RegisteredOrganization")->data.value.uint16, 2);
    EXPECT_EQ(instance.find("SpecificationType")->data.value.uint16, 2);
    EXPECT_EQ(cimom::elements(instance.find("AdvertiseTypes")->data).front().value.uint16, 2);
    return true;
  };
  EXPECT_EQ(manager.enumerateInstances("interop", "CIM_RegisteredProfile", std::nullopt, sink).status.code,
            CMPI_RC_OK);
  EXPECT_THAT(texts, ElementsAre("KELVO:DSP1023-SoftwareInventory-1.0.1", "Software Inventory", "1.0.1"));
}

// No provider is registered here: the association is there all the same, and says whose answer it lacks.
TEST(InteropSchema, tiesTheProfileToTheSoftware) {
  cimom::ObjectManager manager(servedSchema());
  const cimom::Outcome outcome = manager.enumerateInstanceNames(
      "interop", "CIM_ElementConformsToProfile", [](const cimom::ObjectPath&) { return true; });
  EXPECT_EQ(outcome.status.code, CMPI_RC_ERR_NOT_SUPPORTED);
  EXPECT_EQ(outcome.status.description, "no provider is registered for class KELVO_SoftwareIdentity");
}

}  // namespace
