#include <tests/schema/Compiled.h>

#include <cimom/Names.h>
#include <cimom/ProviderRegistration.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <filesystem>
#include <ostream>

namespace {

using cimom::ProviderRegistration;
using testing::ElementsAre;

/// A library, its registration, and the file that declares what it serves.
struct Library {
  const char* name;
  const char* registration;
  const char* classes;
};

void PrintTo(const Library& library, std::ostream* out) {
  *out << library.name;
}

class RegistrationFile : public testing::TestWithParam<Library> {};

TEST_P(RegistrationFile, namesConcreteClassesOfTheSchema) {
  const cimom::ClassRepository classes = compiledSchema();
  for (const ProviderRegistration& each :
       cimom::readRegistrations(schemaFolder() / GetParam().registration)) {
    const cimom::SchemaClass* type = classes.find(each.className);
    ASSERT_NE(type, nullptr) << each.where;
    EXPECT_EQ(type->name(), each.className);
    EXPECT_FALSE(type->isAbstract()) << each.where;
    EXPECT_TRUE(each.instance) << each.where;
    EXPECT_EQ(each.association, type->isAssociation()) << each.where;
    EXPECT_EQ(each.provider, GetParam().name);
    EXPECT_EQ(each.location, GetParam().name);
    EXPECT_THAT(each.nameSpaces, ElementsAre("root/cimv2"));
  }
}

TEST_P(RegistrationFile, coversEveryClassOfTheLibrary) {
  const cimom::ClassRepository classes = compiledSchema();
  const auto registrations = cimom::readRegistrations(schemaFolder() / GetParam().registration);
  std::size_t covered = 0;
  for (const cimom::SchemaClass* each : classes.all()) {
    if (std::filesystem::path(each->declared.file).filename() != GetParam().classes)
      continue;
    ++covered;
    EXPECT_EQ(std::count_if(registrations.begin(), registrations.end(),
                            [each](const auto& one) { return cimom::sameName(one.className, each->name()); }),
              1)
        << each->name();
  }
  EXPECT_EQ(covered, registrations.size());
  EXPECT_GT(covered, 0U);
}

INSTANTIATE_TEST_SUITE_P(Libraries, RegistrationFile,
                         testing::Values(Library{"SoftwareInventoryProvider", "SoftwareInventoryProvider.reg",
                                                 "KELVO_SoftwareInventory.mof"},
                                         Library{"KelvoEndpointProvider", "KelvoEndpointProvider.reg",
                                                 "KELVO_Endpoints.mof"}),
                         [](const auto& each) { return each.param.name; });

}  // namespace
