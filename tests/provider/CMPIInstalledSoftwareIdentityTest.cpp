// The association of software and the computer it is installed on, against the recording stand-in.
#include <CMPIInstalledSoftwareIdentity.h>
#include <Oru/Exceptions.h>
#include <gmock/gmock.h>

#include "AssociationWorld.h"

namespace {

using namespace associations;  // NOLINT(google-build-using-namespace): the tests' own vocabulary
using Oru::FrameworkException;
using Oru::InstrumentationException;
using Oru::ProviderException;
using Adapter = Oru::SoftwareInventoryProfileProvider::CMPIInstalledSoftwareIdentity;
using testing::Contains;
using testing::ElementsAre;
using testing::ElementsAreArray;
using testing::Not;

constexpr const char* className = "KELVO_InstalledSoftwareIdentity";
constexpr const char* notFound = "Could not find specified instance";

/// What describe() says of an association's path.
std::string pair(const std::string& computerName, const std::string& instanceId) {
  return std::string(className) + ".System={" + computerText(computerName) + "},InstalledSoftware={" +
         softwareText(instanceId) + "}";
}

CMPIObjectPath* association(CMPIObjectPath* system, CMPIObjectPath* installed) {
  return path(className, {}, {{"System", system}, {"InstalledSoftware", installed}});
}

class InstalledAssociation : public MachineTest {
 protected:
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
  void narrows(bool value) { served("KELVO_ComputerSystem").narrows = value; }
  std::size_t asksOfComputers() const { return entriesOf(world, "operator bool", "CMPIComputerSystem.cpp"); }
  std::size_t asksOfSoftware() const { return entriesOf(world, "operator bool", "CMPISoftwareIdentity.cpp"); }
};

// ---- From software.

TEST_F(InstalledAssociation, FromSoftwareComesItsComputerAndThenOneNull) {
  EXPECT_THAT(namesFrom(software(nicFirmware)), ElementsAre(computerText("alpha"), "(null)"))
      << "the computer end was not asked before: the first instance is still pending";
  EXPECT_THAT(namesFrom(software(betaDriver)), ElementsAre(computerText("beta"), "(null)"));
}

TEST_F(InstalledAssociation, FromSoftwareComesWhateverTheObjectManagerEnumerates) {
  narrows(false);
  EXPECT_THAT(namesFrom(software(betaDriver)), ElementsAre(computerText("alpha"), computerText("beta")));
}

TEST_F(InstalledAssociation, FromSoftwareWithoutKeysComesEveryComputer) {
  EXPECT_THAT(namesFrom(path("KELVO_SoftwareIdentity")),
              ElementsAre(computerText("alpha"), computerText("beta")));
  EXPECT_THAT(world.calls, Contains("enumerateInstances(KELVO_ComputerSystem)"));
}

TEST_F(InstalledAssociation, FromSoftwareTheInstanceIsTheComputersOwn) {
  Adapter adapter(&broker, nullptr, software(bios));
  EXPECT_EQ(adapter.getAssociator(nullptr), &served("KELVO_ComputerSystem").instances[0]->cmpi);
}

TEST_F(InstalledAssociation, FromSoftwareThatIsNotThereConstructionFails) {
  EXPECT_EQ(constructionFails(software("192@nothing")), "Instrumentation node not available.");
  EXPECT_EQ(thrownBy<FrameworkException>([&] {
              namesFrom(path("KELVO_SoftwareIdentity", {{"Name", "x"}}));
            }),
            "Could not find 'InstanceId' component in Moniker");
}

TEST_F(InstalledAssociation, FromSoftwareAComputerThatNobodyServesFailsConstruction) {
  served("KELVO_ComputerSystem").instances.clear();
  EXPECT_EQ(thrownBy<ProviderException>([&] { namesFrom(software(bios)); }),
            "Could not obtain an instance of Computer System");
}

// ---- From a computer.

TEST_F(InstalledAssociation, FromAComputerComesEverySoftwareIdentityOnePerStep) {
  EXPECT_THAT(namesFrom(path("KELVO_ComputerSystem")), ElementsAreArray(allSoftwareTexts()));
}

TEST_F(InstalledAssociation, TheKeysOfAComputersPathNarrowNothing) {
  EXPECT_THAT(namesFrom(computer("alpha")), ElementsAreArray(allSoftwareTexts()));
  EXPECT_THAT(namesFrom(computer("beta")), ElementsAreArray(allSoftwareTexts()));
  EXPECT_THAT(namesFrom(computer("no such computer")), ElementsAreArray(allSoftwareTexts()));
  EXPECT_TRUE(world.upcalls.empty()) << "the given end is never asked about";
}

TEST_F(InstalledAssociation, FromAComputerTheInstancesAreWhole) {
  Adapter adapter(&broker, nullptr, computer("alpha"));
  const char* properties[] = {"InstanceID", nullptr};
  CMPIInstance* const instance = adapter.getAssociator(properties);
  EXPECT_EQ(propertyOf(instance, "InstanceID"), bios);
  EXPECT_EQ(propertyOf(instance, "Description"), "BIOS");
}

// ---- One association.

TEST_F(InstalledAssociation, BothReferencesCorrectYieldExactlyOneAssociation) {
  EXPECT_THAT(pathsFrom(association(computer("alpha"), software(bmc))), ElementsAre(pair("alpha", bmc)));
  EXPECT_THAT(pathsFrom(association(computer("beta"), software(betaDriver))),
              ElementsAre(pair("beta", betaDriver)));
}

TEST_F(InstalledAssociation, AnotherComputerThanTheOneItIsInstalledOnFailsConstruction) {
  EXPECT_EQ(constructionFails(association(computer("beta"), software(bmc))), notFound);
  EXPECT_EQ(constructionFails(association(computer("Alpha"), software(bmc))), notFound);
}

TEST_F(InstalledAssociation, AMissingReferenceOrNameFailsConstruction) {
  EXPECT_EQ(constructionFails(path(className, {}, {{"System", computer("alpha")}})), notFound);
  EXPECT_EQ(constructionFails(path(className, {}, {{"InstalledSoftware", software(bios)}})), notFound);
  EXPECT_EQ(constructionFails(path(className, {{"Name", "alpha"}})), notFound);
  EXPECT_EQ(constructionFails(association(path("KELVO_ComputerSystem"), software(bios))), notFound);
  EXPECT_EQ(constructionFails(association(computer("alpha"), path("KELVO_SoftwareIdentity"))), notFound)
      << "software without keys locates no computer by name";
}

TEST_F(InstalledAssociation, SoftwareThatIsNotThereFailsWithTheResolversText) {
  EXPECT_EQ(constructionFails(association(computer("alpha"), software("192@nothing"))),
            "Instrumentation node not available.");
}

TEST_F(InstalledAssociation, TheGivenSystemItselfIsAskedForAndMatchedByName) {
  narrows(false);
  CMPIObjectPath* const system = computer("beta");
  EXPECT_THAT(pathsFrom(association(system, software(betaDriver))), ElementsAre(pair("beta", betaDriver)));
  ASSERT_EQ(world.upcalls.size(), 1U);
  EXPECT_EQ(world.upcalls[0].path, system->hdl) << "not the located path";
  EXPECT_THAT(world.calls, Contains("getProperty(Name,false)"));
}

TEST_F(InstalledAssociation, ASystemThatNobodyServesYieldsOneNull) {
  served("KELVO_ComputerSystem").instances.clear();
  EXPECT_THAT(pathsFrom(association(computer("alpha"), software(bios))), ElementsAre("(null)"));
}

TEST_F(InstalledAssociation, TheSoftwareIsReadBeforeTheSystem) {
  Adapter adapter(&broker, nullptr, path(className));
  world.calls.clear();
  EXPECT_TRUE(adapter.setObjectPath(association(computer("alpha"), software(bios))));
  const auto at = [&](const char* call) {
    return std::find(world.calls.begin(), world.calls.end(), call) - world.calls.begin();
  };
  EXPECT_EQ(at("getKeyCount"), 0);
  EXPECT_EQ(at("getKeyProperty(InstalledSoftware,reference)"), 1);
  EXPECT_LT(at("createObjectPath(KELVO_ComputerSystem)"), at("getKeyProperty(System,reference)"));
  EXPECT_LT(at("getKeyProperty(System,reference)"), at("getKeyProperty(Name)"));
}

TEST_F(InstalledAssociation, APathThatFailedStillMakesItASingleInstance) {
  Adapter adapter(&broker, nullptr, path(className));
  EXPECT_FALSE(adapter.setObjectPath(path(className, {}, {{"System", computer("alpha")}})));
  EXPECT_TRUE(static_cast<bool>(adapter)) << "its own field, which the ends have no part in";
  ++adapter;
  EXPECT_FALSE(static_cast<bool>(adapter));
}

// ---- All associations.

TEST_F(InstalledAssociation, WithoutKeysTheWalkIsNestedComputersOutsideSoftwareInside) {
  EXPECT_THAT(pathsFrom(path(className)),
              ElementsAre(pair("alpha", bios), pair("alpha", bmc), pair("alpha", nicFirmware),
                          pair("alpha", nicBootRom), pair("alpha", otherNicFirmware), pair("alpha", driver),
                          pair("beta", betaDriver)));
}

TEST_F(InstalledAssociation, WithoutKeysAndWithoutAnyComputerConstructionFails) {
  served("KELVO_ComputerSystem").instances.clear();
  EXPECT_EQ(thrownBy<ProviderException>([&] { pathsFrom(path(className)); }),
            "Could not obtain an instance of Computer System")
      << "the computer end says so before it can be asked";
}

TEST_F(InstalledAssociation, AFilterOnTheExhaustedSoftwareWalkReadsNoTypeBeyondTheList) {
  Adapter adapter(&broker, nullptr, path(className));
  for (int step = 0; step < 6; ++step) {
    ++adapter;
  }
  EXPECT_EQ(textOf(adapter.getObjectPath()), pair("beta", betaDriver));
  ++adapter;
  EXPECT_FALSE(static_cast<bool>(adapter));
  ++adapter;
  EXPECT_FALSE(static_cast<bool>(adapter)) << "an exhausted walk stays exhausted";
}

TEST_F(InstalledAssociation, AComputerWithoutSoftwareIsAStepOfItsOwn) {
  std::erase_if(world.nodes, [](const standin::Node& candidate) { return candidate.text == "d2"; });
  world.emptyFilterThrows = false;
  Adapter adapter(&broker, nullptr, path(className));
  for (int step = 0; step < 6; ++step) {
    ++adapter;
  }
  EXPECT_TRUE(static_cast<bool>(adapter)) << "valid at the next computer, whatever it has";
  ++adapter;
  EXPECT_FALSE(static_cast<bool>(adapter));
}

TEST_F(InstalledAssociation, AFilterThatThrowsAtTheNextComputerPassesThroughTheStep) {
  std::erase_if(world.nodes, [](const standin::Node& candidate) { return candidate.text == "d2"; });
  Adapter adapter(&broker, nullptr, path(className));
  for (int step = 0; step < 5; ++step) {
    ++adapter;
  }
  EXPECT_EQ(thrownBy<InstrumentationException>([&] { ++adapter; }), "nothing passes the filter");
}

TEST_F(InstalledAssociation, AnUnnamedComputerCountsAsTheOneThatIsLookedFor) {
  node("c0").texts.clear();
  served("KELVO_ComputerSystem").instances.erase(served("KELVO_ComputerSystem").instances.begin());
  EXPECT_THAT(pathsFrom(path(className)),
              ElementsAre(pair("beta", bios), pair("beta", bmc), pair("beta", nicFirmware),
                          pair("beta", nicBootRom), pair("beta", otherNicFirmware), pair("beta", driver)))
      << "beta gets the software of the computer that has no name";
}

TEST_F(InstalledAssociation, TheInstanceCarriesBothReferences) {
  Adapter adapter(&broker, nullptr, path(className));
  CMPIInstance* const instance = adapter.getCMPIInstance(nullptr);
  EXPECT_EQ(textOf(instance), pair("alpha", bios));
  EXPECT_EQ(propertyOf(instance, "System"), computerText("alpha"));
  EXPECT_EQ(propertyOf(instance, "InstalledSoftware"), softwareText(bios));
}

TEST_F(InstalledAssociation, AReferenceThatThePathLacksIsNotCopiedAndTheOtherIs) {
  Adapter adapter(&broker, nullptr, path(className));
  for (const auto& [missing, there] :
       Keys{{"System", "InstalledSoftware"}, {"InstalledSoftware", "System"}}) {
    world.forget();
    adapter.getCMPIInstance(nullptr);
    const auto call =
        std::find(world.calls.begin(), world.calls.end(), "getKeyProperty(" + missing + ",reference)");
    ASSERT_NE(call, world.calls.end());
    world.failAt = static_cast<std::size_t>(call - world.calls.begin()) + 1;
    world.calls.clear();
    CMPIInstance* const instance = adapter.getCMPIInstance(nullptr);
    EXPECT_EQ(propertyOf(instance, missing), "(unset)");
    EXPECT_NE(propertyOf(instance, there), "(unset)");
  }
}

TEST_F(InstalledAssociation, AnEndWithoutAnObjectMakesPathAndInstanceNull) {
  Adapter adapter(&broker, nullptr, computer("alpha"));
  EXPECT_EQ(adapter.getObjectPath(), nullptr) << "the computer end stands on nothing";
  EXPECT_EQ(adapter.getCMPIInstance(nullptr), nullptr);
  EXPECT_THAT(world.calls, Not(Contains(testing::StartsWith("setKeyProperty(System"))));

  for (const std::string made : {"KELVO_SoftwareIdentity", className}) {
    Adapter both(&broker, nullptr, path(className));
    EXPECT_NE(both.getObjectPath(), nullptr);
    world.forget();
    both.getObjectPath();
    const auto call = std::find(world.calls.begin(), world.calls.end(), "createObjectPath(" + made + ")");
    ASSERT_NE(call, world.calls.end());
    world.failAt = static_cast<std::size_t>(call - world.calls.begin()) + 1;
    world.calls.clear();
    EXPECT_EQ(both.getObjectPath(), nullptr) << made;
    world.calls.clear();
    EXPECT_EQ(both.getCMPIInstance(nullptr), nullptr) << made;
  }
}

TEST_F(InstalledAssociation, FromTheAssociationThereIsNoAssociator) {
  Adapter adapter(&broker, nullptr, path(className));
  EXPECT_EQ(adapter.getAssociatorNames(), nullptr);
  EXPECT_EQ(adapter.getAssociator(nullptr), nullptr);
}

// ---- From a path of any other class.

TEST_F(InstalledAssociation, AnUnrelatedPathYieldsOneNullAndTheFirstStepEndsTheWalk) {
  for (CMPIObjectPath* given : {port("eth0"), serviceProcessor("alpha"), path("Other")}) {
    EXPECT_THAT(namesFrom(given), ElementsAre("(null)"));
    EXPECT_THAT(pathsFrom(given), ElementsAre("(null)"));
  }
}

// ---- Its own field, and how often the ends are asked.

TEST_F(InstalledAssociation, WhetherItIsTrueIsItsOwnFieldAndTheEndsAreNotAsked) {
  for (CMPIObjectPath* given :
       {software(bios), computer("alpha"), association(computer("alpha"), software(bios))}) {
    Adapter adapter(&broker, nullptr, given);
    world.log.clear();
    EXPECT_TRUE(static_cast<bool>(adapter));
    EXPECT_TRUE(static_cast<bool>(adapter));
    EXPECT_EQ(asksOfComputers() + asksOfSoftware(), 0U);
  }
}

TEST_F(InstalledAssociation, AStepAsksTheWalkedEndOnce) {
  Adapter fromSoftware(&broker, nullptr, software(bios));
  world.log.clear();
  ++fromSoftware;
  EXPECT_EQ(asksOfComputers(), 1U);
  EXPECT_EQ(asksOfSoftware(), 0U);
  Adapter fromComputer(&broker, nullptr, computer("alpha"));
  world.log.clear();
  ++fromComputer;
  EXPECT_EQ(asksOfComputers(), 0U);
  EXPECT_EQ(asksOfSoftware(), 1U);
}

TEST_F(InstalledAssociation, TheNestedWalkAsksItsEndsAsOftenAsItMust) {
  world.log.clear();
  Adapter adapter(&broker, nullptr, path(className));
  EXPECT_EQ(asksOfComputers(), 1U) << "whether there is a first";
  EXPECT_EQ(asksOfSoftware(), 0U);
  for (int step = 0; step < 7; ++step) {
    const bool software = step < 5;
    const bool nextComputer = step == 5;
    world.log.clear();
    ++adapter;
    EXPECT_EQ(asksOfComputers(), software ? 1U : 2U) << "step " << step;
    EXPECT_EQ(asksOfSoftware(), software || nextComputer ? 1U : 2U) << "step " << step;
  }
}

}  // namespace
