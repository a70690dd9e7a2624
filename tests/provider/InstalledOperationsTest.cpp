// Installed software through the function tables: every case of its resolver, its adapter and its computer
// end that a request can meet.
#include <gmock/gmock.h>

#include "AssociationRequests.h"

namespace {

using namespace associations;  // NOLINT(google-build-using-namespace): the tests' own vocabulary
using testing::Contains;
using testing::ElementsAre;
using testing::ElementsAreArray;
using testing::IsEmpty;

class InstalledOperations : public AssociationRequests {
 protected:
  Answer computerOf(const std::string& instanceId) { return names(software(instanceId), installedClass); }
  /// Enumerates, with these keys as all that the one computer's path has.
  Answer enumerateWith(const Keys& keys) {
    world.served["KELVO_ComputerSystem"] = {};
    served("KELVO_ComputerSystem").instances.push_back(world.newInstance("KELVO_ComputerSystem", keys));
    return enumerateNames(path(installedClass));
  }
};

// ---- From software to its computer.

TEST_F(InstalledOperations, FromSoftwareComesItsComputerAndThenOneNull) {
  const Answer answer = computerOf(nicFirmware);
  EXPECT_THAT(answer.objects, ElementsAre(computerText("alpha"), "(null)"));
  EXPECT_TRUE(answer.isComplete());
  EXPECT_THAT(associators(software(nicFirmware), installedClass).objects,
              ElementsAre(computerText("alpha"), "(null)"));
}

TEST_F(InstalledOperations, SoftwareLevelsBelowItsComputerResolvesToIt) {
  EXPECT_EQ(computerOf(bmc).objects.front(), computerText("alpha"));
  EXPECT_EQ(computerOf(betaDriver).objects.front(), computerText("beta"));
  node("d2").sensorType = 40;
  node("d2").texts = {{108, "alpha"}};
  EXPECT_EQ(computerOf(betaDriver).objects.front(), computerText("alpha")) << "itself a computer";
}

TEST_F(InstalledOperations, AnInstanceIdResolvesThroughItsPathTextAlsoWithBlanks) {
  node("d1").text = "xyz";
  EXPECT_EQ(computerOf("26@xyz").objects.front(), computerText("alpha"));
  EXPECT_EQ(computerOf("26 @ xyz").objects.front(), computerText("alpha"));
}

TEST_F(InstalledOperations, FromSoftwareThatDoesNotResolveComesNothingButTheDoneMarker) {
  const auto failure = [&](const CMPIObjectPath* source) {
    const Answer answer = names(source, installedClass);
    EXPECT_EQ(answer.status.rc, CMPI_RC_OK);
    EXPECT_EQ(answer.done, 1);
    EXPECT_THAT(answer.objects, IsEmpty());
    return answer.failures.empty() ? "(none)" : answer.failures.front();
  };
  EXPECT_EQ(failure(software("192@nothing")), "Instrumentation node not available.");
  EXPECT_EQ(failure(path("KELVO_SoftwareIdentity", {{"Name", "x"}})),
            "Could not find 'InstanceId' component in Moniker");
  node("c0").texts.clear();
  EXPECT_EQ(failure(software(bios)), "Name Property on computer not available.");
  node("c0").sensorType = 41;
  EXPECT_EQ(failure(software(bios)), "Instrumentation node not available.") << "the climb ends at the root";
  serve("KELVO_ComputerSystem", "Name", {});
  EXPECT_EQ(failure(software(betaDriver)), "Could not obtain an instance of Computer System");
}

TEST_F(InstalledOperations, ComputersComeInTheObjectManagersOrder) {
  serve("KELVO_ComputerSystem", "Name", {"gamma", "alpha", "beta"});
  EXPECT_THAT(names(path("KELVO_SoftwareIdentity"), installedClass).objects,
              ElementsAre(computerText("gamma"), computerText("alpha"), computerText("beta")));
}

TEST_F(InstalledOperations, TheComputersInstanceIsWholeWhateverThePropertyList) {
  served("KELVO_ComputerSystem").instances[0]->properties.emplace_back("Dedicated", "0");
  const char* properties[] = {"Name", nullptr};
  associators(software(bios), installedClass, properties);
  EXPECT_EQ(property(0, "Dedicated"), "0");
}

TEST_F(InstalledOperations, AnElementThatCannotBeReadEndsTheWalk) {
  served("KELVO_ComputerSystem").failingElement = 2;
  EXPECT_THAT(names(path("KELVO_SoftwareIdentity"), installedClass).objects,
              ElementsAre(computerText("alpha"), "(null)"));
  served("KELVO_ComputerSystem").failingElement = 1;
  EXPECT_THAT(names(path("KELVO_SoftwareIdentity"), installedClass).failures,
              ElementsAre("Could not obtain an instance of Computer System"));
}

TEST_F(InstalledOperations, ANullEnumerationThatIsOkIsNoCrash) {
  served("KELVO_ComputerSystem").enumerationIsNull = true;
  EXPECT_THAT(computerOf(bios).failures, ElementsAre("Could not obtain an instance of Computer System"));
  const Answer single =
      get(path(installedClass, {}, {{"System", computer("alpha")}, {"InstalledSoftware", software(bios)}}));
  EXPECT_EQ(single.status.rc, CMPI_RC_OK);
}

// ---- From a computer to its software.

TEST_F(InstalledOperations, FromAComputerComesEverySoftwareIdentity) {
  const Answer answer = names(computer("alpha"), installedClass);
  EXPECT_THAT(answer.objects, ElementsAreArray(allSoftwareTexts()));
  EXPECT_TRUE(answer.isComplete());
  EXPECT_EQ(associators(computer("alpha"), installedClass).objects, answer.objects);
}

TEST_F(InstalledOperations, AComputerThatDoesNotExistNarrowsNothing) {
  EXPECT_THAT(names(computer("no such computer"), installedClass).objects,
              ElementsAreArray(allSoftwareTexts()));
  EXPECT_THAT(names(path("KELVO_ComputerSystem"), installedClass).objects,
              ElementsAreArray(allSoftwareTexts()));
}

// ---- All associations.

TEST_F(InstalledOperations, ANameInLowerCaseIsNoNameKey) {
  const Answer answer = enumerateWith({{"name", "alpha"}});
  EXPECT_THAT(answer.failures, ElementsAre("Could not find 'Name' component in Moniker"));
  EXPECT_EQ(answer.done, 0);
}

TEST_F(InstalledOperations, OfTwoNameKeysTheFirstCounts) {
  std::erase_if(world.nodes, [](const standin::Node& candidate) { return candidate.type == 3; });
  const Answer answer = enumerateWith({{"Name", "beta"}, {"Name", "alpha"}});
  ASSERT_EQ(answer.objects.size(), 1U);
  EXPECT_THAT(answer.objects[0], testing::EndsWith("InstalledSoftware={" + softwareText(betaDriver) + "}"));
}

TEST_F(InstalledOperations, TheWalkPassesOtherComputersToTheNamedOne) {
  std::erase_if(world.nodes, [](const standin::Node& candidate) { return candidate.type == 3; });
  EXPECT_THAT(enumerateWith({{"Name", "beta"}}).objects, ElementsAre(installedText("beta", betaDriver)));
  EXPECT_THAT(enumerateWith({{"Name", "gamma"}}).failures,
              ElementsAre("Concerned Computer Could Not Be Found."));
}

TEST_F(InstalledOperations, AnUnnamedComputerCountsAsTheMatch) {
  node("c0").texts.clear();
  EXPECT_THAT(enumerateWith({{"Name", "beta"}}).objects,
              ElementsAre(installedText("beta", bios), installedText("beta", bmc),
                          installedText("beta", nicFirmware), installedText("beta", nicBootRom),
                          installedText("beta", otherNicFirmware), installedText("beta", driver)));
}

TEST_F(InstalledOperations, TheNodeNumberIsThePathTextReadAsHexadecimal) {
  world.nodes = {{40, "1a", "", "1a", "Computer System", {{108, "alpha"}}, {}},
                 {44, "d1", "1a", "1a", "driver", {}, {}}};
  EXPECT_THAT(enumerateWith({{"Name", "alpha"}}).objects, ElementsAre(installedText("alpha", "26@d1")));
  EXPECT_THAT(world.calls, Contains("setFilter(2,\"/1a\")"));
  world.nodes = {{40, "zz", "", "zz", "Computer System", {{108, "alpha"}}, {}},
                 {44, "d1", "zz", "zz", "driver", {}, {}}};
  enumerateWith({{"Name", "alpha"}});
  EXPECT_THAT(world.calls, Contains("setFilter(1,\"/0\")"));
}

TEST_F(InstalledOperations, WithoutAnyComputerNothingIsEnumerated) {
  serve("KELVO_ComputerSystem", "Name", {});
  const Answer answer = enumerateNames(path(installedClass));
  EXPECT_EQ(answer.status.rc, CMPI_RC_OK);
  EXPECT_THAT(answer.objects, IsEmpty());
  EXPECT_EQ(answer.done, 0);
  EXPECT_EQ(answer.failures.size(), 1U);
}

TEST_F(InstalledOperations, AComputerWithoutSoftwareIsNoOverrun) {
  std::erase_if(world.nodes, [](const standin::Node& candidate) { return candidate.text == "d2"; });
  world.emptyFilterThrows = false;
  for (const Answer& answer : {enumerateNames(path(installedClass)), enumerate(path(installedClass))}) {
    EXPECT_EQ(answer.objects.size(), 7U) << "a step of its own at the next computer";
    EXPECT_TRUE(answer.isComplete());
  }
}

// ---- One association.

TEST_F(InstalledOperations, ANameThatDiffersInLetterCaseFindsNoAssociation) {
  CMPIObjectPath* const given =
      path(installedClass, {}, {{"System", computer("ALPHA")}, {"InstalledSoftware", software(bios)}});
  EXPECT_THAT(get(given).failures, ElementsAre("Could not find specified instance"));
}

TEST_F(InstalledOperations, ASystemThatNobodyServesYieldsOneNull) {
  serve("KELVO_ComputerSystem", "Name", {"Alpha"});
  served("KELVO_ComputerSystem").narrows = false;
  const Answer answer =
      get(path(installedClass, {}, {{"System", computer("alpha")}, {"InstalledSoftware", software(bios)}}));
  EXPECT_THAT(answer.objects, ElementsAre("(null)")) << "matched by name, letter case included";
  EXPECT_TRUE(answer.isComplete());
}

TEST_F(InstalledOperations, TheMatchIsFoundAmongOthersAndTheRestIsDrained) {
  served("KELVO_ComputerSystem").narrows = false;
  const Answer answer =
      get(path(installedClass, {}, {{"System", computer("alpha")}, {"InstalledSoftware", software(bios)}}));
  EXPECT_THAT(answer.objects, ElementsAre(installedText("alpha", bios)));
  EXPECT_EQ(countCalls("getNext"), 2U);
  EXPECT_EQ(countCalls("hasNext"), 3U);
  EXPECT_EQ(countCalls("getProperty(Name,false)"), 1U) << "nothing is compared after the match";
}

TEST_F(InstalledOperations, FromTheAssociationItselfThereIsNoFarEnd) {
  const Answer answer = names(path(installedClass), installedClass);
  EXPECT_THAT(answer.objects, testing::AllOf(testing::SizeIs(7), testing::Each("(null)")));
  EXPECT_TRUE(answer.isComplete());
}

TEST_F(InstalledOperations, AnUnrelatedSourceYieldsOneNull) {
  for (CMPIObjectPath* source : {port("eth0"), serviceProcessor("alpha"), path("Other")}) {
    EXPECT_THAT(names(source, installedClass).objects, ElementsAre("(null)"));
    EXPECT_THAT(associators(source, installedClass).objects, ElementsAre("(null)"));
  }
}

}  // namespace
