// The associations of the two kinds of system firmware, CMPIBMCSoftwareIdentity and CMPIBIOSSoftwareIdentity,
// against the recording stand-in: one suite for both.
#include <CMPIBIOSSoftwareIdentity.h>
#include <CMPIBMCSoftwareIdentity.h>
#include <Oru/Exceptions.h>
#include <gmock/gmock.h>

#include "AssociationWorld.h"

namespace {

using namespace associations;  // NOLINT(google-build-using-namespace): the tests' own vocabulary
using Oru::FrameworkException;
using Oru::InstrumentationException;
using Oru::ProviderException;
using Oru::SoftwareInventoryProfileProvider::CMPIBIOSSoftwareIdentity;
using Oru::SoftwareInventoryProfileProvider::CMPIBMCSoftwareIdentity;
using testing::ElementsAre;
using testing::IsEmpty;

struct BMC {
  using Adapter = CMPIBMCSoftwareIdentity;
  static constexpr const char* name = "CMPIBMCSoftwareIdentity";
  static constexpr const char* className = "KELVO_BMCSoftwareIdentity";
  static constexpr const char* computerClass = "KELVO_SPComputerSystem";
  static constexpr const char* otherComputerClass = "KELVO_ComputerSystem";
  static constexpr const char* id = "224@f2";
  static constexpr const char* otherKind = "192@f1";
  static constexpr const char* wrongKind = "The specified firmware is not a BMC firmware";
  static constexpr const char* otherComputer = "A BMC associated with this computer is not available.";
};

struct BIOS {
  using Adapter = CMPIBIOSSoftwareIdentity;
  static constexpr const char* name = "CMPIBIOSSoftwareIdentity";
  static constexpr const char* className = "KELVO_BIOSSoftwareIdentity";
  static constexpr const char* computerClass = "KELVO_ComputerSystem";
  static constexpr const char* otherComputerClass = "KELVO_SPComputerSystem";
  static constexpr const char* id = "192@f1";
  static constexpr const char* otherKind = "224@f2";
  static constexpr const char* wrongKind = "The specified firmware is not a BIOS firmware";
  static constexpr const char* otherComputer = "A BIOS associated with this computer is not available.";
};

template <typename Kind>
class FirmwareAssociation : public MachineTest {
 protected:
  using Adapter = typename Kind::Adapter;

  std::vector<std::string> namesFrom(const CMPIObjectPath* given) {
    Adapter adapter(&broker, nullptr, given);
    return walk(adapter, [](Adapter& at) { return at.getAssociatorNames(); });
  }
  std::vector<std::string> pathsFrom(const CMPIObjectPath* given) {
    Adapter adapter(&broker, nullptr, given);
    return walk(adapter, [](Adapter& at) { return at.getObjectPath(); });
  }
  std::string constructionFails(const CMPIObjectPath* given) {
    return thrownBy<InstrumentationException>([&] { const Adapter adapter(&broker, nullptr, given); });
  }
  void serveComputers(const std::vector<std::string>& names) {
    serveInstances(world, Kind::computerClass, "Name", names);
  }

  CMPIObjectPath* classPath() { return path(Kind::className); }
  CMPIObjectPath* computerPath(const std::string& name) {
    return path(Kind::computerClass, {{"Name", name}});
  }
  std::string computerName(const std::string& name) {
    return std::string(Kind::computerClass) + ".Name=" + name;
  }
  std::string pair(const std::string& antecedent, const std::string& dependent) {
    return std::string(Kind::className) + ".Antecedent={" + antecedent + "},Dependent={" + dependent + "}";
  }
  std::size_t asksOfComputers() const { return entriesOf(world, "operator bool", "CMPIComputerSystem.cpp"); }
  std::size_t asksOfSoftware() const { return entriesOf(world, "operator bool", "CMPISoftwareIdentity.cpp"); }
};

struct KindNames {
  template <typename Kind>
  static std::string GetName(int) {  // NOLINT(readability-identifier-naming): GoogleTest asks for it
    return Kind::name;
  }
};
using Kinds = testing::Types<BMC, BIOS>;
TYPED_TEST_SUITE(FirmwareAssociation, Kinds, KindNames);

// ---- The two ends.

TYPED_TEST(FirmwareAssociation, FromTheComputerComesItsFirmware) {
  EXPECT_THAT(this->namesFrom(this->computerPath("alpha")), ElementsAre(softwareText(TypeParam::id)));
}

TYPED_TEST(FirmwareAssociation, FromTheFirmwareComesItsComputer) {
  EXPECT_THAT(this->namesFrom(software(TypeParam::id)), ElementsAre(this->computerName("alpha")))
      << "and no null after it: the end is asked each time";
}

TYPED_TEST(FirmwareAssociation, FromSoftwareOfAnotherKindConstructionFails) {
  EXPECT_EQ(this->constructionFails(software(TypeParam::otherKind)), TypeParam::wrongKind);
  EXPECT_EQ(this->constructionFails(software(driver)), "The specified software is not a firmware");
}

TYPED_TEST(FirmwareAssociation, FromAnotherComputerConstructionFails) {
  EXPECT_EQ(this->constructionFails(this->computerPath("beta")), TypeParam::otherComputer);
}

TYPED_TEST(FirmwareAssociation, FromAComputerWithoutAKeyedNameConstructionFails) {
  EXPECT_EQ(thrownBy<FrameworkException>([&] {
              this->namesFrom(path(TypeParam::computerClass, {{"CreationClassName", "x"}}));
            }),
            "Could not find 'Name' key in Moniker");
}

TYPED_TEST(FirmwareAssociation, FromAComputerClassPathEverySoftwareComes) {
  EXPECT_THAT(this->namesFrom(path(TypeParam::computerClass)), testing::ElementsAreArray(allSoftwareTexts()))
      << "a path without keys stays bare, and selects nothing";
}

TYPED_TEST(FirmwareAssociation, FromASoftwareClassPathEveryComputerComes) {
  this->serveComputers({"alpha", "beta"});
  EXPECT_THAT(this->namesFrom(path("KELVO_SoftwareIdentity")),
              ElementsAre(this->computerName("alpha"), this->computerName("beta")));
}

TYPED_TEST(FirmwareAssociation, TheComputerIsAskedForByTheLocatedName) {
  this->namesFrom(software(TypeParam::id));
  EXPECT_THAT(this->world.calls,
              testing::Contains("enumerateInstances(" + this->computerName("alpha") + ")"));
  EXPECT_THAT(this->world.calls, testing::Not(testing::Contains("getProperty(Name,false)")))
      << "walked, not matched by name";
}

TYPED_TEST(FirmwareAssociation, AssociatorsAreTheInstancesOfTheFarEnd) {
  typename TypeParam::Adapter fromSoftware(&this->broker, nullptr, software(TypeParam::id));
  EXPECT_EQ(fromSoftware.getAssociator(nullptr), &this->served(TypeParam::computerClass).instances[0]->cmpi);
  typename TypeParam::Adapter fromComputer(&this->broker, nullptr, this->computerPath("alpha"));
  EXPECT_EQ(propertyOf(fromComputer.getAssociator(nullptr), "InstanceID"), TypeParam::id);
}

TYPED_TEST(FirmwareAssociation, AComputerThatNobodyServesFailsConstruction) {
  this->serveComputers({});
  EXPECT_EQ(thrownBy<ProviderException>([&] { this->namesFrom(software(TypeParam::id)); }),
            "Could not obtain an instance of Computer System");
  EXPECT_EQ(thrownBy<ProviderException>([&] { this->namesFrom(this->classPath()); }),
            "Could not obtain an instance of Computer System");
}

// ---- The association itself.

TYPED_TEST(FirmwareAssociation, TheAntecedentIsTheComputerAndTheDependentTheFirmware) {
  this->serveComputers({"alpha"});
  EXPECT_THAT(this->pathsFrom(this->classPath()),
              ElementsAre(this->pair(this->computerName("alpha"), softwareText(TypeParam::id))));
}

TYPED_TEST(FirmwareAssociation, TheInstanceCarriesBothReferences) {
  typename TypeParam::Adapter adapter(&this->broker, nullptr, this->classPath());
  CMPIInstance* const instance = adapter.getCMPIInstance(nullptr);
  EXPECT_EQ(propertyOf(instance, "Antecedent"), this->computerName("alpha"));
  EXPECT_EQ(propertyOf(instance, "Dependent"), softwareText(TypeParam::id));
}

TYPED_TEST(FirmwareAssociation, ItIsFalseAsSoonAsEitherEndIsExhausted) {
  this->serveComputers({"alpha", "beta"});
  typename TypeParam::Adapter adapter(&this->broker, nullptr, this->classPath());
  EXPECT_TRUE(static_cast<bool>(adapter));
  ++adapter;
  EXPECT_FALSE(static_cast<bool>(adapter)) << "a second computer, but no second firmware";
  EXPECT_THAT(this->pathsFrom(this->classPath()).size(), 1U);
  this->serveComputers({"alpha"});
  typename TypeParam::Adapter other(&this->broker, nullptr, this->classPath());
  EXPECT_TRUE(static_cast<bool>(other)) << "the first computer";
  ++other;
  EXPECT_FALSE(static_cast<bool>(other));
}

TYPED_TEST(FirmwareAssociation, BothEndsMoveInStepTheSoftwareFirst) {
  this->serveComputers({"alpha", "beta"});
  typename TypeParam::Adapter adapter(&this->broker, nullptr, this->classPath());
  const std::vector<std::string> calls = this->callsOf([&] { ++adapter; });
  EXPECT_EQ(calls.front(), "operator++") << "the software's cursor";
  EXPECT_EQ(calls.back(), "getNext") << "then the computers' enumeration";
  EXPECT_THAT(textOf(adapter.getObjectPath()), testing::HasSubstr("={" + this->computerName("beta") + "}"));
}

TYPED_TEST(FirmwareAssociation, TheSoftwareIsAskedOnlyAfterTheComputerSaidYes) {
  typename TypeParam::Adapter adapter(&this->broker, nullptr, this->classPath());
  this->world.log.clear();
  EXPECT_TRUE(static_cast<bool>(adapter));
  EXPECT_EQ(this->asksOfComputers(), 1U);
  EXPECT_EQ(this->asksOfSoftware(), 1U);
  ++adapter;
  this->world.log.clear();
  EXPECT_FALSE(static_cast<bool>(adapter));
  EXPECT_EQ(this->asksOfComputers(), 1U);
  EXPECT_EQ(this->asksOfSoftware(), this->world.served.at(TypeParam::computerClass).instances.size() - 1)
      << "where there is no second computer it is not asked";
}

TYPED_TEST(FirmwareAssociation, AStepAsksNobody) {
  for (CMPIObjectPath* given : {this->classPath(), software(TypeParam::id), this->computerPath("alpha")}) {
    typename TypeParam::Adapter adapter(&this->broker, nullptr, given);
    this->world.log.clear();
    ++adapter;
    EXPECT_EQ(this->asksOfComputers() + this->asksOfSoftware(), 0U);
  }
}

TYPED_TEST(FirmwareAssociation, TheFirmwareIsLocatedFromTheFirstComputer) {
  this->serveComputers({"beta", "alpha"});
  EXPECT_EQ(this->constructionFails(this->classPath()), TypeParam::otherComputer);
}

TYPED_TEST(FirmwareAssociation, AKeyedAssociationPathHasNoInstanceId) {
  CMPIObjectPath* const keyed =
      path(TypeParam::className, {},
           {{"Antecedent", this->computerPath("alpha")}, {"Dependent", software(TypeParam::id)}});
  EXPECT_EQ(thrownBy<FrameworkException>([&] { this->pathsFrom(keyed); }),
            "Could not find 'InstanceId' key in Moniker");
}

TYPED_TEST(FirmwareAssociation, FromTheAssociationThereIsNoAssociator) {
  typename TypeParam::Adapter adapter(&this->broker, nullptr, this->classPath());
  EXPECT_EQ(adapter.getAssociatorNames(), nullptr);
  EXPECT_EQ(adapter.getAssociator(nullptr), nullptr);
}

// ---- Nulls, and other classes.

TYPED_TEST(FirmwareAssociation, AnEndWithoutAnObjectIsPutIntoThePathAsANull) {
  typename TypeParam::Adapter adapter(&this->broker, nullptr, this->computerPath("alpha"));
  EXPECT_EQ(textOf(adapter.getObjectPath()), this->pair("(null)", softwareText(TypeParam::id)));
  CMPIInstance* const instance = adapter.getCMPIInstance(nullptr);
  EXPECT_EQ(propertyOf(instance, "Antecedent"), "(unset)") << "copied only where the path has it";
  EXPECT_EQ(propertyOf(instance, "Dependent"), softwareText(TypeParam::id));
}

TYPED_TEST(FirmwareAssociation, APathOrInstanceThatCannotBeMadeIsNull) {
  typename TypeParam::Adapter adapter(&this->broker, nullptr, this->classPath());
  this->world.forget();
  this->world.failAt = 1;
  EXPECT_EQ(adapter.getObjectPath(), nullptr);
  EXPECT_EQ(this->world.faultCall, std::string("createObjectPath(") + TypeParam::className + ")");
  this->world.calls.clear();
  EXPECT_EQ(adapter.getCMPIInstance(nullptr), nullptr);
  EXPECT_THAT(this->world.calls, testing::Not(testing::Contains("createInstance")));
  this->world.forget();
  adapter.getCMPIInstance(nullptr);
  const auto call = std::find(this->world.calls.begin(), this->world.calls.end(), "createInstance");
  this->world.failAt = static_cast<std::size_t>(call - this->world.calls.begin()) + 1;
  this->world.calls.clear();
  EXPECT_EQ(adapter.getCMPIInstance(nullptr), nullptr);
}

TYPED_TEST(FirmwareAssociation, APathOfAnyOtherClassYieldsNothing) {
  for (CMPIObjectPath* given : {path(TypeParam::otherComputerClass, {{"Name", "alpha"}}), port("eth0"),
                                path("KELVO_InstalledSoftwareIdentity"), path("Other")}) {
    EXPECT_THAT(this->namesFrom(given), IsEmpty());
    typename TypeParam::Adapter adapter(&this->broker, nullptr, given);
    this->world.calls.clear();
    ++adapter;
    EXPECT_THAT(this->world.calls, IsEmpty());
    EXPECT_EQ(adapter.getAssociatorNames(), nullptr);
    EXPECT_EQ(adapter.getAssociator(nullptr), nullptr);
  }
}

}  // namespace
