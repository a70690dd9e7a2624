// The loaded provider over the real framework, on machines/associations.json: every association in both
// directions, with the agent's own computers, service processors and ports at the other end.
#include <gmock/gmock.h>

#include "RealAssociations.h"

namespace {

using testing::ElementsAre;
using testing::ElementsAreArray;
using testing::IsEmpty;

constexpr const char* installed = "KELVO_InstalledSoftwareIdentity";
constexpr const char* network = "KELVO_NetworkSoftwareIdentity";
constexpr const char* bmc = "KELVO_BMCSoftwareIdentity";
constexpr const char* bios = "KELVO_BIOSSoftwareIdentity";

const std::vector<std::string> allSoftware = {
    "KELVO_SoftwareIdentity(192@f1)", "KELVO_SoftwareIdentity(192@f2)", "KELVO_SoftwareIdentity(26@f3)",
    "KELVO_SoftwareIdentity(26@f4)",  "KELVO_SoftwareIdentity(27@f5)",  "KELVO_SoftwareIdentity(192@d1)",
    "KELVO_SoftwareIdentity(193@d2)"};

TEST_F(RealAssociations, FromAComputerComesAllSoftwareWhateverItsName) {
  for (const char* name : {"alpha", "beta", "no such computer"}) {
    const Answer answer = names(computer(name), installed);
    EXPECT_THAT(answer.objects, ElementsAreArray(allSoftware));
    EXPECT_EQ(answer.done, 1);
    EXPECT_EQ(associators(computer(name), installed).objects, answer.objects);
  }
}

TEST_F(RealAssociations, FromSoftwareComesItsComputerAndOneNull) {
  EXPECT_THAT(names(software("27@f5"), installed).objects,
              ElementsAre("KELVO_ComputerSystem(alpha)", "(null)"));
  EXPECT_THAT(associators(software("193@d2"), installed).objects,
              ElementsAre("KELVO_ComputerSystem(beta)", "(null)"));
}

TEST_F(RealAssociations, InstalledSoftwareIsEnumeratedOverBothComputers) {
  const Answer answer = enumerateNames(installed);
  std::vector<std::string> expected;
  for (const std::string& software : allSoftware) {
    const bool isBeta = software.find("193@") != std::string::npos;
    expected.push_back(std::string(installed) + "(KELVO_ComputerSystem(" + (isBeta ? "beta" : "alpha") +
                       ")," + software + ")");
  }
  EXPECT_EQ(answer.status, CMPI_RC_OK);
  EXPECT_THAT(answer.objects, ElementsAreArray(expected));
  EXPECT_EQ(answer.done, 1);
  EXPECT_EQ(enumerate(installed).objects, answer.objects);
}

TEST_F(RealAssociations, EveryInstalledAssociationCanBeFetched) {
  const Answer all = enumerateNames(installed);
  ASSERT_EQ(all.paths.size(), 7U);
  for (std::size_t i = 0; i < all.paths.size(); ++i) {
    const Answer answer = get(all.paths[i]);
    EXPECT_EQ(answer.status, CMPI_RC_OK);
    EXPECT_THAT(answer.objects, ElementsAre(all.objects[i]));
    EXPECT_EQ(answer.done, 1);
  }
}

TEST_F(RealAssociations, TheManagementControllersFirmwareAndItsServiceProcessor) {
  const CMPIObjectPath* const processor =
      path("KELVO_SPComputerSystem", {{"CreationClassName", "KELVO_SPComputerSystem"}, {"Name", "alpha"}});
  EXPECT_THAT(names(processor, bmc).objects, ElementsAre("KELVO_SoftwareIdentity(192@f2)"));
  EXPECT_THAT(names(software("192@f2"), bmc).objects, ElementsAre("KELVO_SPComputerSystem(alpha)"));
  EXPECT_THAT(associators(software("192@f2"), bmc).objects, ElementsAre("KELVO_SPComputerSystem(alpha)"));
  EXPECT_THAT(enumerateNames(bmc).objects,
              ElementsAre("KELVO_BMCSoftwareIdentity(KELVO_SPComputerSystem(alpha),"
                          "KELVO_SoftwareIdentity(192@f2))"));
  EXPECT_THAT(names(software("192@f1"), bmc).objects, IsEmpty());
}

TEST_F(RealAssociations, TheBiosAndItsComputer) {
  EXPECT_THAT(names(computer("alpha"), bios).objects, ElementsAre("KELVO_SoftwareIdentity(192@f1)"));
  EXPECT_THAT(names(computer("beta"), bios).objects, IsEmpty());
  EXPECT_THAT(names(software("192@f1"), bios).objects, ElementsAre("KELVO_ComputerSystem(alpha)"));
  const Answer answer = enumerate(bios);
  EXPECT_THAT(answer.objects, ElementsAre("KELVO_BIOSSoftwareIdentity(KELVO_ComputerSystem(alpha),"
                                          "KELVO_SoftwareIdentity(192@f1))"));
  EXPECT_EQ(answer.done, 1);
}

TEST_F(RealAssociations, NetworkFirmwareAndPorts) {
  for (const char* deviceId : {"0000:17:00.0", "0000:17:00.1"}) {
    EXPECT_THAT(names(port(deviceId), network).objects,
                ElementsAre("KELVO_SoftwareIdentity(26@f3)", "KELVO_SoftwareIdentity(26@f4)"))
        << "from a port all firmware of its device";
  }
  EXPECT_THAT(names(port("0000:31:00.0"), network).objects, ElementsAre("KELVO_SoftwareIdentity(27@f5)"));
  EXPECT_THAT(names(port("0000:99:00.0"), network).objects, IsEmpty());
  EXPECT_THAT(names(software("26@f4"), network).objects, ElementsAre("KELVO_NetworkPort(0000:17:00.0)"))
      << "from firmware its device's first port alone";
  EXPECT_THAT(names(software("192@f1"), network).objects, IsEmpty());
  EXPECT_THAT(names(path("KELVO_NetworkPort"), network).objects,
              ElementsAre("KELVO_SoftwareIdentity(26@f3)", "KELVO_SoftwareIdentity(26@f4)"));
  EXPECT_THAT(names(path("KELVO_SoftwareIdentity"), network).objects,
              ElementsAre("KELVO_NetworkPort(0000:17:00.0)", "KELVO_NetworkPort(0000:17:00.1)"))
      << "every port but the last";
}

TEST_F(RealAssociations, TheNetworkAssociationIsEnumeratedForTheFirstDeviceAlone) {
  const Answer answer = enumerateNames(network);
  EXPECT_THAT(answer.objects, ElementsAre("KELVO_NetworkSoftwareIdentity(KELVO_SoftwareIdentity(26@f3),"
                                          "KELVO_NetworkPort(0000:17:00.0))",
                                          "KELVO_NetworkSoftwareIdentity(KELVO_SoftwareIdentity(26@f4),"
                                          "KELVO_NetworkPort(0000:17:00.0))"));
  EXPECT_EQ(answer.done, 1);
  EXPECT_EQ(enumerate(network).objects, answer.objects);
}

TEST_F(RealAssociations, AParentClassReachesItsAssociationsInOrder) {
  EXPECT_THAT(names(software("192@f2"), "CIM_ElementSoftwareIdentity").objects,
              ElementsAre("KELVO_SPComputerSystem(alpha)"));
  const Answer all = names(path("KELVO_SoftwareIdentity"), nullptr);
  EXPECT_THAT(all.objects, ElementsAre("KELVO_ComputerSystem(alpha)", "KELVO_ComputerSystem(beta)",
                                       "KELVO_NetworkPort(0000:17:00.0)", "KELVO_NetworkPort(0000:17:00.1)",
                                       "KELVO_SPComputerSystem(alpha)", "KELVO_ComputerSystem(alpha)",
                                       "KELVO_ComputerSystem(beta)"))
      << "no class at all means every one";
  EXPECT_EQ(all.done, 1);
}

TEST_F(RealAssociations, OtherClassesAreInvalid) {
  const Answer unrelated = names(software("192@f1"), "CIM_Chassis");
  EXPECT_EQ(unrelated.status, CMPI_RC_ERR_INVALID_CLASS);
  EXPECT_EQ(unrelated.done, 1);
  const Answer noAssociation = names(software("192@f1"), "KELVO_SoftwareIdentity");
  EXPECT_EQ(noAssociation.status, CMPI_RC_ERR_INVALID_CLASS);
  EXPECT_EQ(noAssociation.done, 0);
  EXPECT_THAT(names(path("Other"), installed).objects, ElementsAre("(null)"));
}

TEST_F(RealAssociations, OnlyInstalledAssociationsAreFetchedSingly) {
  for (const char* className : {network, bmc, bios}) {
    EXPECT_EQ(get(path(className)).status, CMPI_RC_ERR_NOT_SUPPORTED);
  }
}

}  // namespace
