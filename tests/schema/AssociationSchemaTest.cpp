// The association classes and what they tie together, as object managers see them.
#include <tests/schema/Compiled.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <string>
#include <vector>

namespace {

using cimom::ClassRepository;
using cimom::SchemaClass;
using cimom::mof::Property;
using testing::ElementsAre;
using testing::IsEmpty;

std::vector<std::string> ancestry(const ClassRepository& classes, const std::string& name) {
  std::vector<std::string> names;
  for (const SchemaClass* each = classes.find(name); each != nullptr; each = each->superclass)
    names.push_back(each->name());
  return names;
}

std::vector<std::string> keyNames(const ClassRepository& classes, const std::string& name) {
  std::vector<std::string> names;
  for (const Property* each : classes.find(name)->keys())
    names.push_back(each->name);
  std::sort(names.begin(), names.end());
  return names;
}

/// What a class declares itself.
std::vector<std::string> ownNames(const ClassRepository& classes, const std::string& name) {
  std::vector<std::string> names;
  for (const Property& each : classes.find(name)->declared.properties)
    names.push_back(each.name);
  return names;
}

std::string classOfReference(const ClassRepository& classes, const std::string& name, const char* reference) {
  const Property* property = classes.find(name)->property(reference);
  return property == nullptr ? "(none)" : property->referenceClass;
}

constexpr const char* elementAssociations[] = {"KELVO_BMCSoftwareIdentity", "KELVO_BIOSSoftwareIdentity",
                                               "KELVO_NetworkSoftwareIdentity"};

TEST(AssociationSchema, InstalledSoftwareHasNoAncestorButItsOwn) {
  EXPECT_THAT(ancestry(compiledSchema(), "KELVO_InstalledSoftwareIdentity"),
              ElementsAre("KELVO_InstalledSoftwareIdentity", "CIM_InstalledSoftwareIdentity"));
}

TEST(AssociationSchema, FirmwareOfElementsIsADependency) {
  const ClassRepository classes = compiledSchema();
  for (const char* name : elementAssociations)
    EXPECT_THAT(ancestry(classes, name), ElementsAre(name, "CIM_ElementSoftwareIdentity", "CIM_Dependency"));
}

TEST(AssociationSchema, ClassesOfThisSystemAreConcreteAssociations) {
  const ClassRepository classes = compiledSchema();
  for (const char* name : {"KELVO_InstalledSoftwareIdentity", "KELVO_BMCSoftwareIdentity",
                           "KELVO_BIOSSoftwareIdentity", "KELVO_NetworkSoftwareIdentity"}) {
    EXPECT_TRUE(classes.find(name)->isAssociation()) << name;
    EXPECT_FALSE(classes.find(name)->isAbstract()) << name;
  }
  EXPECT_TRUE(classes.find("CIM_Dependency")->isAbstract());
}

TEST(AssociationSchema, BothReferencesAreTheKeys) {
  const ClassRepository classes = compiledSchema();
  for (const char* name : {"CIM_InstalledSoftwareIdentity", "KELVO_InstalledSoftwareIdentity"})
    EXPECT_THAT(keyNames(classes, name), ElementsAre("InstalledSoftware", "System")) << name;
  for (const char* name : {"CIM_Dependency", "CIM_ElementSoftwareIdentity", "KELVO_BMCSoftwareIdentity",
                           "KELVO_BIOSSoftwareIdentity", "KELVO_NetworkSoftwareIdentity"})
    EXPECT_THAT(keyNames(classes, name), ElementsAre("Antecedent", "Dependent")) << name;
}

TEST(AssociationSchema, ReferencesOfCimAreThoseOfTheStandard) {
  const ClassRepository classes = compiledSchema();
  const char* installed = "CIM_InstalledSoftwareIdentity";
  EXPECT_EQ(classOfReference(classes, installed, "System"), "CIM_System");
  EXPECT_EQ(classOfReference(classes, installed, "InstalledSoftware"), "CIM_SoftwareIdentity");
  const char* element = "CIM_ElementSoftwareIdentity";
  EXPECT_EQ(classOfReference(classes, element, "Antecedent"), "CIM_SoftwareIdentity");
  EXPECT_EQ(classOfReference(classes, element, "Dependent"), "CIM_ManagedElement");
  EXPECT_EQ(classOfReference(classes, "CIM_Dependency", "Antecedent"), "CIM_ManagedElement");
  EXPECT_EQ(classOfReference(classes, "CIM_Dependency", "Dependent"), "CIM_ManagedElement");
}

TEST(AssociationSchema, InstalledSoftwareOverridesBothReferences) {
  const ClassRepository classes = compiledSchema();
  const char* name = "KELVO_InstalledSoftwareIdentity";
  EXPECT_THAT(ownNames(classes, name), ElementsAre("System", "InstalledSoftware"));
  EXPECT_EQ(classOfReference(classes, name, "System"), "KELVO_ComputerSystem");
  EXPECT_EQ(classOfReference(classes, name, "InstalledSoftware"), "KELVO_SoftwareIdentity");
}

TEST(AssociationSchema, ControllersAndBiosOverrideTheDependentAlone) {
  const ClassRepository classes = compiledSchema();
  for (const char* name : {"KELVO_BMCSoftwareIdentity", "KELVO_BIOSSoftwareIdentity"}) {
    EXPECT_THAT(ownNames(classes, name), ElementsAre("Dependent"));
    EXPECT_EQ(classOfReference(classes, name, "Dependent"), "KELVO_SoftwareIdentity") << name;
    EXPECT_EQ(classOfReference(classes, name, "Antecedent"), "CIM_SoftwareIdentity") << name;
  }
}

TEST(AssociationSchema, NetworkOverridesBothReferences) {
  const ClassRepository classes = compiledSchema();
  const char* name = "KELVO_NetworkSoftwareIdentity";
  EXPECT_THAT(ownNames(classes, name), ElementsAre("Antecedent", "Dependent"));
  EXPECT_EQ(classOfReference(classes, name, "Antecedent"), "KELVO_SoftwareIdentity");
  EXPECT_EQ(classOfReference(classes, name, "Dependent"), "KELVO_NetworkPort");
}

// Object managers refuse what is not so ("type mismatch"); the compiler of this one does not look.
TEST(AssociationSchema, EachReferenceIsOverriddenWithASubclass) {
  const ClassRepository classes = compiledSchema();
  std::size_t overrides = 0;
  for (const SchemaClass* each : classes.all()) {
    for (const Property& property : each->declared.properties) {
      const Property* above =
          each->superclass == nullptr ? nullptr : each->superclass->property(property.name);
      if (!property.isReference() || above == nullptr)
        continue;
      EXPECT_TRUE(classes.isA(property.referenceClass, above->referenceClass))
          << each->name() << '.' << property.name;
      ++overrides;
    }
  }
  EXPECT_EQ(overrides, 8U);
}

TEST(EndpointSchema, HasTheAncestryOfCim) {
  const ClassRepository classes = compiledSchema();
  for (const char* name : {"KELVO_ComputerSystem", "KELVO_SPComputerSystem"})
    EXPECT_THAT(ancestry(classes, name),
                ElementsAre(name, "CIM_ComputerSystem", "CIM_System", "CIM_EnabledLogicalElement",
                            "CIM_LogicalElement", "CIM_ManagedSystemElement", "CIM_ManagedElement"));
  EXPECT_THAT(ancestry(classes, "KELVO_NetworkPort"),
              ElementsAre("KELVO_NetworkPort", "CIM_NetworkPort", "CIM_LogicalPort", "CIM_LogicalDevice",
                          "CIM_EnabledLogicalElement", "CIM_LogicalElement", "CIM_ManagedSystemElement",
                          "CIM_ManagedElement"));
}

TEST(EndpointSchema, HasTheKeysOfCim) {
  const ClassRepository classes = compiledSchema();
  for (const char* name : {"CIM_System", "KELVO_ComputerSystem", "KELVO_SPComputerSystem"})
    EXPECT_THAT(keyNames(classes, name), ElementsAre("CreationClassName", "Name")) << name;
  for (const char* name : {"CIM_LogicalDevice", "KELVO_NetworkPort"})
    EXPECT_THAT(keyNames(classes, name),
                ElementsAre("CreationClassName", "DeviceID", "SystemCreationClassName", "SystemName"))
        << name;
  EXPECT_THAT(keyNames(classes, "CIM_EnabledLogicalElement"), IsEmpty());
}

TEST(EndpointSchema, DeclaresWhatTheProviderSets) {
  const ClassRepository classes = compiledSchema();
  struct {
    const char* className;
    const char* property;
    CMPIType type;
    const char* origin;
  } const expected[] = {
      {"KELVO_ComputerSystem", "ElementName", CMPI_string, "CIM_ManagedElement"},
      {"KELVO_ComputerSystem", "Dedicated", CMPI_uint16A, "CIM_ComputerSystem"},
      {"KELVO_SPComputerSystem", "EnabledState", CMPI_uint16, "CIM_EnabledLogicalElement"},
      {"KELVO_NetworkPort", "PermanentAddress", CMPI_string, "CIM_NetworkPort"},
      {"KELVO_NetworkPort", "LinkTechnology", CMPI_uint16, "CIM_NetworkPort"},
      {"KELVO_NetworkPort", "OtherLinkTechnology", CMPI_string, "CIM_NetworkPort"},
      {"KELVO_NetworkPort", "Speed", CMPI_uint64, "CIM_LogicalPort"},
      {"KELVO_NetworkPort", "EnabledState", CMPI_uint16, "CIM_EnabledLogicalElement"},
      {"KELVO_NetworkPort", "SystemName", CMPI_string, "CIM_LogicalDevice"},
      {"KELVO_NetworkPort", "DeviceID", CMPI_string, "CIM_LogicalDevice"},
  };
  for (const auto& each : expected) {
    const Property* property = classes.find(each.className)->property(each.property);
    ASSERT_NE(property, nullptr) << each.property;
    EXPECT_EQ(property->type, each.type) << each.property;
    EXPECT_EQ(property->origin, each.origin) << each.property;
  }
}

/// The text that CIM has for a number of a property.
std::string valueText(const ClassRepository& classes, const char* className, const char* property,
                      const std::string& number) {
  const auto& qualifiers = classes.find(className)->property(property)->qualifiers;
  const auto& map = cimom::mof::findQualifier(qualifiers, "ValueMap")->value.elements;
  const auto& values = cimom::mof::findQualifier(qualifiers, "Values")->value.elements;
  for (std::size_t index = 0; index < map.size(); ++index) {
    if (std::get<std::string>(map[index]) == number)
      return std::get<std::string>(values.at(index));
  }
  return "(none)";
}

TEST(EndpointSchema, HasTheNumbersThatTheProviderUses) {
  const ClassRepository classes = compiledSchema();
  const auto state = [&](const char* number) {
    return valueText(classes, "KELVO_NetworkPort", "EnabledState", number);
  };
  EXPECT_EQ(state("2"), "Enabled");
  EXPECT_EQ(state("3"), "Disabled");
  EXPECT_EQ(state("6"), "Enabled but Offline");
  EXPECT_EQ(state("7"), "In Test");
  const auto technology = [&](const char* number) {
    return valueText(classes, "KELVO_NetworkPort", "LinkTechnology", number);
  };
  EXPECT_EQ(technology("1"), "Other");
  EXPECT_EQ(technology("2"), "Ethernet");
  EXPECT_EQ(technology("3"), "IB");
  EXPECT_EQ(technology("11"), "Wireless LAN");
  EXPECT_EQ(valueText(classes, "KELVO_ComputerSystem", "Dedicated", "0"), "Not Dedicated");
  EXPECT_EQ(valueText(classes, "KELVO_SPComputerSystem", "Dedicated", "28"), "Management Controller");
}

}  // namespace
