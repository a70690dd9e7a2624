// The registrations for other object managers: each class that is registered with swinv is registered with
// them, and says the same.
#include <tests/schema/Compiled.h>

#include <cimom/ProviderRegistration.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <fstream>
#include <iterator>
#include <optional>
#include <set>
#include <string>
#include <vector>

namespace {

using cimom::ClassRepository;
using cimom::ProviderRegistration;
using cimom::mof::InstanceDeclaration;
using cimom::mof::Scalar;
using testing::HasSubstr;
using testing::MatchesRegex;
using testing::Not;

std::string textOf(const std::filesystem::path& file) {
  std::ifstream stream(file);
  return {std::istreambuf_iterator<char>(stream), std::istreambuf_iterator<char>()};
}

/// The values of a property that an instance gives, as texts; none where it does not.
std::vector<std::string> valuesOf(const InstanceDeclaration& instance, const std::string& property) {
  std::vector<std::string> values;
  for (const auto& [name, value] : instance.values) {
    if (name != property)
      continue;
    for (const Scalar& each : value.elements) {
      if (const auto* text = std::get_if<std::string>(&each))
        values.push_back(*text);
      else if (const auto* number = std::get_if<std::int64_t>(&each))
        values.push_back(std::to_string(*number));
      else
        ADD_FAILURE() << property << " is neither text nor number";
    }
  }
  return values;
}

std::string valueOf(const InstanceDeclaration& instance, const std::string& property) {
  const std::vector<std::string> values = valuesOf(instance, property);
  return values.size() == 1 ? values.front() : "(" + std::to_string(values.size()) + " values)";
}

class Registrations : public testing::TestWithParam<const char*> {
 protected:
  static std::vector<ProviderRegistration> own() {
    return cimom::readRegistrations(schemaFolder() / (std::string(GetParam()) + ".reg"));
  }
  static std::filesystem::path sfcbFile() {
    return schemaFolder() / "registration" / "sfcb" / (std::string(GetParam()) + ".reg");
  }
  static std::filesystem::path pegasusFile() {
    return schemaFolder() / "registration" / "pegasus" / (std::string(GetParam()) + ".mof");
  }

  /// The instances of a class in the file for OpenPegasus, which compiles into its interop namespace.
  static std::vector<InstanceDeclaration> instancesOf(const std::string& className) {
    ClassRepository classes;
    classes.compileFile(PEGASUS_CLASSES);
    classes.compileFile(pegasusFile());
    std::vector<InstanceDeclaration> instances;
    std::set<std::string> known{"PG_ProviderModule", "PG_Provider", "PG_ProviderCapabilities"};
    for (const InstanceDeclaration& each : classes.instances()) {
      EXPECT_TRUE(known.contains(each.className)) << each.className;
      if (each.className == className)
        instances.push_back(each);
    }
    return instances;
  }

  /// The one instance of a class.
  static InstanceDeclaration theOne(const std::string& className) {
    const std::vector<InstanceDeclaration> instances = instancesOf(className);
    EXPECT_EQ(instances.size(), 1U) << className;
    return instances.empty() ? InstanceDeclaration{} : instances.front();
  }
};

// By the reader of swinv's own files, which share the form.
TEST_P(Registrations, ForSfcbSayTheSameAsOurOwn) {
  const std::vector<ProviderRegistration> expected = own();
  const std::vector<ProviderRegistration> made = cimom::readRegistrations(sfcbFile());
  ASSERT_EQ(made.size(), expected.size());
  for (std::size_t i = 0; i < made.size(); ++i) {
    EXPECT_EQ(made[i].className, expected[i].className);
    EXPECT_EQ(made[i].provider, expected[i].provider);
    EXPECT_EQ(made[i].location, expected[i].location);
    EXPECT_EQ(made[i].instance, expected[i].instance);
    EXPECT_EQ(made[i].association, expected[i].association);
    EXPECT_EQ(made[i].nameSpaces, expected[i].nameSpaces);
  }
}

// What swinv's own files have beyond these is unknown there.
TEST_P(Registrations, ForSfcbHaveTheFourEntriesAlone) {
  std::ifstream stream(sfcbFile());
  std::size_t entries = 0;
  for (std::string line; std::getline(stream, line);) {
    if (line.empty() || line.front() == '#' || line.front() == '[')
      continue;
    EXPECT_THAT(line, MatchesRegex("   (provider|location|type|namespace): [A-Za-z0-9/ ]+"));
    ++entries;
  }
  EXPECT_EQ(entries, 4 * own().size());
  EXPECT_THAT(textOf(sfcbFile()), Not(HasSubstr("instance  association")));
}

TEST_P(Registrations, ForPegasusNameTheLibraryAndTheInterface) {
  const InstanceDeclaration module = theOne("PG_ProviderModule");
  EXPECT_EQ(valueOf(module, "Name"), std::string(GetParam()) + "Module") << "as swinv register calls it";
  EXPECT_EQ(valueOf(module, "Vendor"), "Kelvo");
  EXPECT_EQ(valueOf(module, "Version"), SWINV_VERSION);
  EXPECT_EQ(valueOf(module, "InterfaceType"), "CMPI");
  EXPECT_EQ(valueOf(module, "InterfaceVersion"), "2.0.0");
  EXPECT_EQ(valueOf(module, "Location"), GetParam()) << "without lib and .so";

  const InstanceDeclaration provider = theOne("PG_Provider");
  EXPECT_EQ(valueOf(provider, "ProviderModuleName"), valueOf(module, "Name"));
  EXPECT_EQ(valueOf(provider, "Name"), own().front().provider) << "the factories begin with it";
}

TEST_P(Registrations, ForPegasusHaveACapabilityForEachClass) {
  const std::vector<ProviderRegistration> expected = own();
  const std::vector<InstanceDeclaration> made = instancesOf("PG_ProviderCapabilities");
  ASSERT_EQ(made.size(), expected.size());
  std::set<std::string> ids;
  for (std::size_t i = 0; i < made.size(); ++i) {
    const ProviderRegistration& ours = expected[i];
    EXPECT_EQ(valueOf(made[i], "ClassName"), ours.className);
    EXPECT_EQ(valueOf(made[i], "ProviderName"), ours.provider);
    EXPECT_EQ(valueOf(made[i], "ProviderModuleName"), valueOf(theOne("PG_ProviderModule"), "Name"));
    EXPECT_EQ(valuesOf(made[i], "Namespaces"), ours.nameSpaces);
    const std::vector<std::string> types =
        ours.association ? std::vector<std::string>{"2", "3"} : std::vector<std::string>{"2"};
    EXPECT_EQ(valuesOf(made[i], "ProviderType"), types) << ours.className;
    EXPECT_TRUE(ids.insert(valueOf(made[i], "CapabilityID")).second) << "an id of its own each";
  }
}

// Two modules with one name, or two capabilities with one key, would overwrite each other.
TEST(RegistrationsOfAllLibraries, HaveModulesOfTheirOwn) {
  ClassRepository classes;
  classes.compileFile(PEGASUS_CLASSES);
  std::set<std::string> modules;
  std::size_t count = 0;
  for (const char* library : {"KelvoEndpointProvider", "SoftwareInventoryProvider"}) {
    classes.compileFile(schemaFolder() / "registration" / "pegasus" / (std::string(library) + ".mof"));
  }
  for (const InstanceDeclaration& each : classes.instances()) {
    if (each.className == "PG_ProviderModule") {
      modules.insert(valueOf(each, "Name"));
      ++count;
    }
  }
  EXPECT_EQ(count, 2U);
  EXPECT_EQ(modules.size(), count);
}

INSTANTIATE_TEST_SUITE_P(Libraries, Registrations,
                         testing::Values("SoftwareInventoryProvider", "KelvoEndpointProvider"),
                         [](const auto& each) { return each.param; });

}  // namespace
