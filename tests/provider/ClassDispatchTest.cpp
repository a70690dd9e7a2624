// From a class name to the ids of the associations that it stands for.
#include <SoftwareInventoryProvider.h>
#include <gmock/gmock.h>

#include "standin/StandIn.h"

namespace {

using Oru::SoftwareInventoryProfileProvider::getClassId;
using testing::ElementsAre;
using testing::IsEmpty;

class ClassDispatch : public testing::Test {
 protected:
  ClassDispatch() {
    standin::world().forget();
    standin::world().ancestors = {
        {"CIM_ElementSoftwareIdentity", {"CIM_ElementSoftwareIdentity"}},
        {"CIM_InstalledSoftwareIdentity", {"CIM_InstalledSoftwareIdentity"}},
        {"Both", {"CIM_InstalledSoftwareIdentity", "CIM_ElementSoftwareIdentity"}},
        {"KELVO_BMCSoftwareIdentity", {"CIM_ElementSoftwareIdentity"}},
    };
  }

  std::vector<std::uint16_t> ids;
};

TEST_F(ClassDispatch, AKnownClassYieldsItsOneIdWhateverItsAncestors) {
  EXPECT_TRUE(getClassId("KELVO_BMCSoftwareIdentity", "root/cimv2", ids));
  EXPECT_THAT(ids, ElementsAre(117));
  EXPECT_THAT(standin::world().calls, ElementsAre("getClassId(KELVO_BMCSoftwareIdentity)"));
}

TEST_F(ClassDispatch, ElementSoftwareIdentityYieldsNetworkBmcBios) {
  EXPECT_TRUE(getClassId("CIM_ElementSoftwareIdentity", "root/cimv2", ids));
  EXPECT_THAT(ids, ElementsAre(35, 117, 118));
}

TEST_F(ClassDispatch, InstalledSoftwareIdentityYieldsItsId) {
  EXPECT_TRUE(getClassId("CIM_InstalledSoftwareIdentity", "root/cimv2", ids));
  EXPECT_THAT(ids, ElementsAre(3));
}

TEST_F(ClassDispatch, AClassRelatedToBothYieldsAllInOrder) {
  EXPECT_TRUE(getClassId("Both", "root/cimv2", ids));
  EXPECT_THAT(ids, ElementsAre(3, 35, 117, 118));
}

TEST_F(ClassDispatch, BothRelationshipsAreAlwaysTested) {
  getClassId("Both", "root/other", ids);
  EXPECT_THAT(
      standin::world().calls,
      ElementsAre("getClassId(Both)", "areClassesRelated(CIM_InstalledSoftwareIdentity) in root/other",
                  "areClassesRelated(CIM_ElementSoftwareIdentity) in root/other"));
}

TEST_F(ClassDispatch, AnUnrelatedClassYieldsNothing) {
  EXPECT_FALSE(getClassId("CIM_Chassis", "root/cimv2", ids));
  EXPECT_THAT(ids, IsEmpty());
}

TEST_F(ClassDispatch, IdsAreAppended) {
  ids = {7};
  EXPECT_TRUE(getClassId("KELVO_BMCSoftwareIdentity", "root/cimv2", ids));
  EXPECT_THAT(ids, ElementsAre(7, 117));
  EXPECT_FALSE(getClassId("CIM_Chassis", nullptr, ids));
  EXPECT_THAT(ids, ElementsAre(7, 117));
}

TEST_F(ClassDispatch, RelationshipsAreAskedOfTheStoredBroker) {
  CMPIBroker second{};
  SoftwareInventoryProvider_Create_InstanceMI(nullptr, nullptr, nullptr);
  SoftwareInventoryProvider_Create_AssociationMI(&second, nullptr, nullptr);
  EXPECT_EQ(Oru::SoftwareInventoryProfileProvider::broker, &second);
  getClassId("Both", "root/cimv2", ids);
  EXPECT_THAT(standin::world().brokersUsed, ElementsAre(&second, &second));
}

}  // namespace
