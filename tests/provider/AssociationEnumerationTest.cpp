// The association classes through the instance interface: enumerated each, fetched singly one of them.
#include <gmock/gmock.h>

#include "AssociationRequests.h"

namespace {

using namespace associations;  // NOLINT(google-build-using-namespace): the tests' own vocabulary
using testing::ElementsAre;
using testing::IsEmpty;

using AssociationEnumeration = AssociationRequests;

CMPIObjectPath* installed(CMPIObjectPath* system, CMPIObjectPath* identity) {
  return path(installedClass, {}, {{"System", system}, {"InstalledSoftware", identity}});
}

TEST_F(AssociationEnumeration, InstalledSoftwareComesComputerByComputer) {
  const Answer answer = enumerateNames(path(installedClass));
  EXPECT_THAT(answer.objects,
              ElementsAre(installedText("alpha", bios), installedText("alpha", bmc),
                          installedText("alpha", nicFirmware), installedText("alpha", nicBootRom),
                          installedText("alpha", otherNicFirmware), installedText("alpha", driver),
                          installedText("beta", betaDriver)));
  EXPECT_TRUE(answer.isComplete());
  EXPECT_EQ(enumerate(path(installedClass)).objects, answer.objects);
  EXPECT_EQ(property(6, "System"), computerText("beta"));
  EXPECT_EQ(property(6, "InstalledSoftware"), softwareText(betaDriver));
}

TEST_F(AssociationEnumeration, BmcAssociationsAreEnumeratedButNotFetchedSingly) {
  const Answer answer = enumerate(path(bmcClass));
  EXPECT_THAT(answer.objects, ElementsAre(bmcText("alpha", bmc)));
  EXPECT_TRUE(answer.isComplete());
  EXPECT_EQ(property(0, "Antecedent"), serviceProcessorText("alpha"));
  EXPECT_EQ(property(0, "Dependent"), softwareText(bmc));
  ASSERT_EQ(world.returnedInstances.size(), 1U);
  const Answer single = get(&world.returnedInstances[0]->path->cmpi);
  EXPECT_EQ(single.status.rc, CMPI_RC_ERR_NOT_SUPPORTED);
  EXPECT_THAT(single.objects, IsEmpty());
  EXPECT_EQ(single.done, 0);
}

TEST_F(AssociationEnumeration, OnlyInstalledSoftwareCanBeFetchedSingly) {
  for (const char* className : {networkClass, bmcClass, biosClass}) {
    const Answer answer = get(path(className));
    EXPECT_EQ(answer.status.rc, CMPI_RC_ERR_NOT_SUPPORTED) << className;
    EXPECT_EQ(answer.done, 0);
    EXPECT_THAT(world.calls, ElementsAre("getClassId(path)")) << "nothing is built";
  }
}

TEST_F(AssociationEnumeration, BiosAssociationsEndWithTheFirmware) {
  const Answer answer = enumerateNames(path(biosClass));
  EXPECT_THAT(answer.objects, ElementsAre(biosText("alpha", bios)));
  EXPECT_TRUE(answer.isComplete());
  EXPECT_EQ(enumerate(path(biosClass)).objects, answer.objects);
}

TEST_F(AssociationEnumeration, NetworkAssociationsReachTheFirstDeviceAlone) {
  const Answer answer = enumerateNames(path(networkClass));
  EXPECT_THAT(answer.objects, ElementsAre(networkText(nicFirmware, "eth0"), networkText(nicBootRom, "eth0")));
  EXPECT_TRUE(answer.isComplete());
  EXPECT_EQ(enumerate(path(networkClass)).objects, answer.objects);
}

TEST_F(AssociationEnumeration, GetFindsTheInstanceForItsKeys) {
  const Answer answer = get(installed(computer("alpha"), software(nicFirmware)));
  EXPECT_THAT(answer.objects, ElementsAre(installedText("alpha", nicFirmware)));
  EXPECT_TRUE(answer.isComplete());
  EXPECT_EQ(property(0, "System"), computerText("alpha"));
  EXPECT_EQ(property(0, "InstalledSoftware"), softwareText(nicFirmware));
}

TEST_F(AssociationEnumeration, GetOfEndsThatDoNotBelongTogetherIsOkAndEmptyWithoutTheDoneMarker) {
  for (CMPIObjectPath* given : {installed(computer("beta"), software(bios)),
                                path(installedClass, {}, {{"System", computer("alpha")}})}) {
    const Answer answer = get(given);
    EXPECT_EQ(answer.status.rc, CMPI_RC_OK);
    EXPECT_THAT(answer.objects, IsEmpty());
    EXPECT_EQ(answer.done, 0);
    EXPECT_THAT(answer.failures, ElementsAre("Could not find specified instance"));
  }
}

TEST_F(AssociationEnumeration, GetDeliversEachPositionWithoutCounting) {
  const Answer answer = get(path(installedClass));
  EXPECT_EQ(answer.objects.size(), 7U) << "a path without keys is an enumeration";
  EXPECT_TRUE(answer.isComplete());
}

TEST_F(AssociationEnumeration, EveryInstalledAssociationThatIsEnumeratedCanBeFetched) {
  enumerateNames(path(installedClass));
  const std::vector<standin::Path*> all = world.returnedPaths;
  ASSERT_EQ(all.size(), 7U);
  for (standin::Path* each : all) {
    const Answer answer = get(&each->cmpi);
    EXPECT_THAT(answer.objects, ElementsAre(standin::describe(each)));
    EXPECT_TRUE(answer.isComplete());
  }
}

TEST_F(AssociationEnumeration, ANullPathFromAnAssociationAdapterIsHandedOnAsItIs) {
  for (const char* className : {installedClass, networkClass, bmcClass, biosClass}) {
    const std::string call = std::string("createObjectPath(") + className + ")";
    failFirst(call, [&] { enumInstanceNames(path(className)); });
    EXPECT_EQ(enumInstanceNames(path(className)).rc, CMPI_RC_OK);
    ASSERT_FALSE(world.returnedPaths.empty());
    EXPECT_EQ(world.returnedPaths.front(), nullptr) << className;
    EXPECT_EQ(world.done, 1);
    failFirst(call, [&] { enumInstances(path(className)); });
    EXPECT_EQ(enumInstances(path(className)).rc, CMPI_RC_OK);
    ASSERT_FALSE(world.returnedInstances.empty());
    EXPECT_EQ(world.returnedInstances.front(), nullptr) << className;
    EXPECT_EQ(world.done, 1);
  }
}

TEST_F(AssociationEnumeration, AnExceptionKeepsWhatWasDeliveredAndSendsNoDoneMarker) {
  // Nothing below the second computer passes the filter.
  std::erase_if(world.nodes, [](const standin::Node& candidate) { return candidate.text == "d2"; });
  const Answer answer = enumerateNames(path(installedClass));
  EXPECT_EQ(answer.objects.size(), 6U);
  EXPECT_EQ(answer.status.rc, CMPI_RC_OK);
  EXPECT_EQ(answer.done, 0);
  EXPECT_THAT(answer.failures, ElementsAre("nothing passes the filter"));
}

TEST_F(AssociationEnumeration, WithoutTheOtherProvidersObjectsTheFailureIsLogged) {
  world.served.clear();
  const auto failure = [&](const char* className) { return enumerateNames(path(className)).failures; };
  EXPECT_THAT(failure(installedClass), ElementsAre("Could not obtain an instance of Computer System"));
  EXPECT_THAT(failure(bmcClass), ElementsAre("Could not obtain an instance of Computer System"));
  EXPECT_THAT(failure(biosClass), ElementsAre("Could not obtain an instance of Computer System"));
  EXPECT_THAT(failure(networkClass), ElementsAre("Could not obtain an instance of Network Port"));
}

TEST_F(AssociationEnumeration, AKeyedPathOfTheOthersFailsForWantOfItsKey) {
  CMPIObjectPath* const bmcPath =
      path(bmcClass, {}, {{"Antecedent", serviceProcessor("alpha")}, {"Dependent", software(bmc)}});
  EXPECT_THAT(enumerate(bmcPath).failures, ElementsAre("Could not find 'InstanceId' key in Moniker"));
  CMPIObjectPath* const networkPath =
      path(networkClass, {}, {{"Antecedent", software(nicFirmware)}, {"Dependent", port("eth0")}});
  EXPECT_THAT(enumerate(networkPath).failures, ElementsAre("Could not find 'DeviceId' Key in Moniker"));
}

}  // namespace
