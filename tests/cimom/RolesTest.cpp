#include "Linked.h"

namespace {

using association_test::Linked;
using testing::Contains;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::Not;

class Roles : public Linked {};

TEST_F(Roles, resultClassCoversTheClassesBelowIt) {
  EXPECT_THAT(ends(serverPath, {.associationClass = "TEST_Installed", .resultClass = "TEST_Firmware"}),
              ElementsAre("TEST_Firmware f1", "TEST_Firmware f2"));
  EXPECT_EQ(ends(serverPath, {.associationClass = "TEST_Installed", .resultClass = "test_software"}).size(),
            3U);
  EXPECT_EQ(ends(serverPath, {.associationClass = "TEST_Installed", .resultClass = "TEST_Element"}).size(),
            3U);
  EXPECT_THAT(ends(serverPath, {.associationClass = "TEST_Installed", .resultClass = "TEST_System"}),
              IsEmpty());
  EXPECT_THAT(ends(firmwarePath, {.associationClass = "TEST_Installed", .resultClass = "TEST_Controller"}),
              ElementsAre("TEST_Controller c"));
}

TEST_F(Roles, areHandedOnToTheProvider) {
  associatorNames(firmwarePath, {"TEST_Runs", "TEST_System", "dependent", "Antecedent"});
  EXPECT_THAT(calls(), Contains("associatorNames of=TEST_Runs result=TEST_System role=dependent "
                                "resultRole=Antecedent"));
}

// TEST_Runs declares its Antecedent as software and delivers the controller in it.
TEST_F(Roles, goByWhatIsDeliveredNotByWhatIsDeclared) {
  EXPECT_THAT(ends(firmwarePath, {.associationClass = "TEST_ElementSoftware", .role = "Dependent"}),
              ElementsAre("TEST_Controller c"));
  EXPECT_THAT(ends(firmwarePath, {.associationClass = "TEST_ElementSoftware", .role = "Antecedent"}),
              ElementsAre("TEST_Port p"));
  EXPECT_THAT(ends(controllerPath, {.associationClass = "TEST_ElementSoftware", .role = "ANTECEDENT"}),
              ElementsAre("TEST_Firmware f1"));
  EXPECT_THAT(ends(controllerPath, {.associationClass = "TEST_ElementSoftware", .role = "Dependent"}),
              IsEmpty());
}

TEST_F(Roles, ofTheFarEndGoByWhatIsDeliveredToo) {
  EXPECT_THAT(ends(firmwarePath, {.associationClass = "TEST_ElementSoftware", .resultRole = "antecedent"}),
              ElementsAre("TEST_Controller c"));
  EXPECT_THAT(ends(firmwarePath, {.associationClass = "TEST_ElementSoftware", .resultRole = "Dependent"}),
              ElementsAre("TEST_Port p"));
  EXPECT_THAT(
      ends(firmwarePath,
           {.associationClass = "TEST_ElementSoftware", .role = "Dependent", .resultRole = "Antecedent"}),
      ElementsAre("TEST_Controller c"));
}

TEST_F(Roles, ofOneReferenceAreNotTwoEnds) {
  EXPECT_THAT(
      ends(firmwarePath, {.associationClass = "TEST_Peer", .role = "Antecedent", .resultRole = "ANTECEDENT"}),
      IsEmpty());
  EXPECT_THAT(calls(), IsEmpty());
}

// The first path of TEST_Installed tells TEST_System and TEST_Firmware.
TEST_F(Roles, coverClassesBelowThoseDelivered) {
  EXPECT_THAT(ends(controllerPath, {.associationClass = "TEST_Installed", .role = "System"}),
              ElementsAre("TEST_Firmware f1"));
  EXPECT_THAT(ends(controllerPath, {.associationClass = "TEST_Installed", .role = "Installed"}), IsEmpty());
}

TEST_F(Roles, ofClassesThatWereNotDeliveredFirstGoByTheDeclaration) {
  EXPECT_THAT(ends(driverPath, {.associationClass = "TEST_Installed", .role = "Installed"}),
              ElementsAre("TEST_System s"));
  EXPECT_THAT(ends(driverPath, {.associationClass = "TEST_Installed", .role = "System"}), IsEmpty());
  EXPECT_EQ(ends(serverPath, {.associationClass = "TEST_Installed", .resultRole = "Installed"}).size(), 3U);
}

TEST_F(Roles, areLearnedOnceForAllRequests) {
  for (int round = 0; round < 3; ++round)
    associatorNames(firmwarePath, {.associationClass = "TEST_Runs", .role = "Dependent"});
  EXPECT_THAT(calls(), ElementsAre("enumerate of=TEST_Runs", "associatorNames of=TEST_Runs role=Dependent",
                                   "associatorNames of=TEST_Runs role=Dependent",
                                   "associatorNames of=TEST_Runs role=Dependent"));
}

TEST_F(Roles, areNotLearnedWhereNobodyAsksForThem) {
  associatorNames(serverPath);
  EXPECT_THAT(calls(), Not(Contains(testing::StartsWith("enumerate"))));
}

// Neither is the provider asked for anything, because it cannot have the answer.
TEST_F(Roles, areNotLearnedInClassesThatLackThem) {
  EXPECT_THAT(ends(serverPath, {.associationClass = "TEST_Installed", .role = "Antecedent"}), IsEmpty());
  EXPECT_THAT(ends(serverPath, {.associationClass = "TEST_Installed", .resultRole = "None"}), IsEmpty());
  EXPECT_THAT(ends(serverPath, {.associationClass = "TEST_Installed", .role = "Note"}), IsEmpty());
  EXPECT_THAT(calls(), IsEmpty());
}

// TEST_Silent enumerates nothing yet, so it is asked anew; TEST_AssociationOnly has no enumeration to ask
// for.
TEST_F(Roles, goByTheDeclarationWhereNothingIsDelivered) {
  EXPECT_THAT(ends(serverPath, {.associationClass = "TEST_Silent", .role = "Owner"}),
              ElementsAre("TEST_Software silent"));
  EXPECT_THAT(ends(serverPath, {.associationClass = "TEST_Silent", .role = "Owned"}), IsEmpty());
  EXPECT_THAT(calls(), Contains("enumerate of=TEST_Silent").Times(4));
  EXPECT_THAT(ends(serverPath, {.associationClass = "TEST_AssociationOnly", .resultRole = "Owned"}),
              ElementsAre("TEST_Software only"));
  EXPECT_THAT(calls(), Not(Contains("enumerate of=TEST_AssociationOnly")));
  EXPECT_THAT(complaints(), IsEmpty());
}

TEST_F(Roles, goByTheDeclarationWhereTheEnumerationFails) {
  EXPECT_THAT(associatorNames(serverPath, {.associationClass = "TEST_Broken", .role = "Owner"}).objects,
              ElementsAre("TEST_Software broken"));
  EXPECT_THAT(complaints(), ElementsAre("roles in class TEST_Broken go by its declaration, because its names "
                                        "cannot be enumerated: out of order"));
}

TEST_F(Roles, areLearnedFromAnEnumerationThatThrowsLater) {
  const auto answer = associatorNames(serverPath, {.associationClass = "TEST_FaultThrows", .role = "Two"});
  EXPECT_EQ(answer.outcome.status.code, CMPI_RC_OK);
  EXPECT_THAT(calls(), ElementsAre("enumerate of=TEST_FaultThrows"));
}

// Its enumeration asks for its own associations in a role. That ends, with the declaration.
TEST_F(Roles, mayBeAskedForWhileTheyAreLearned) {
  EXPECT_THAT(associatorNames(serverPath, {.associationClass = "TEST_Circular", .role = "Owner"}).objects,
              ElementsAre("TEST_Software circular"));
  EXPECT_THAT(calls(),
              ElementsAre("enumerate of=TEST_Circular", "associatorNames of=TEST_Circular role=Owner",
                          "associatorNames of=TEST_Circular role=Owner"));
}

// Both ends of TEST_Peer are firmware: a class cannot tell which stands where.
TEST_F(Roles, ofOneClassAtBothEndsAreLeftToTheProvider) {
  EXPECT_THAT(ends(firmwarePath, {.associationClass = "TEST_Peer", .role = "Antecedent"}),
              ElementsAre("TEST_Firmware f2", "TEST_Firmware f3"));
}

}  // namespace
