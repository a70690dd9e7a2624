#include <cimom/Names.h>
#include <cimom/ProviderRegistration.h>
#include <cimom/mof/ClassRepository.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <filesystem>

namespace {

using cimom::ProviderRegistration;
using testing::ElementsAre;

const std::filesystem::path folder = SCHEMA_FOLDER;

TEST(RegistrationFile, namesConcreteClassesOfTheSchema) {
  cimom::ClassRepository classes;
  classes.compileFile(folder / "CIM_Core.mof");
  classes.compileFile(folder / "KELVO_SoftwareInventory.mof");
  const auto registrations = cimom::readRegistrations(folder / "SoftwareInventoryProvider.reg");
  for (const ProviderRegistration& each : registrations) {
    const cimom::SchemaClass* type = classes.find(each.className);
    ASSERT_NE(type, nullptr) << each.where;
    EXPECT_EQ(type->name(), each.className);
    EXPECT_FALSE(type->isAbstract()) << each.where;
    EXPECT_TRUE(each.instance) << each.where;
    EXPECT_EQ(each.association, type->isAssociation()) << each.where;
    EXPECT_EQ(each.provider, "SoftwareInventoryProvider");
    EXPECT_EQ(each.location, "SoftwareInventoryProvider");
    EXPECT_THAT(each.nameSpaces, ElementsAre("root/cimv2"));
  }
}

TEST(RegistrationFile, coversEveryClassOfTheProvider) {
  cimom::ClassRepository classes;
  classes.compileFile(folder / "CIM_Core.mof");
  classes.compileFile(folder / "KELVO_SoftwareInventory.mof");
  const auto registrations = cimom::readRegistrations(folder / "SoftwareInventoryProvider.reg");
  for (const cimom::SchemaClass* each : classes.all()) {
    if (std::filesystem::path(each->declared.file).filename() != "KELVO_SoftwareInventory.mof")
      continue;
    EXPECT_EQ(std::count_if(registrations.begin(), registrations.end(),
                            [each](const auto& one) { return cimom::sameName(one.className, each->name()); }),
              1)
        << each->name();
  }
}

}  // namespace
