#include "Linked.h"

#include <stdexcept>

namespace {

using association_test::Answer;
using association_test::Linked;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

class Associators : public Linked {};

TEST_F(Associators, areTheFarEndsInBothDirections) {
  EXPECT_THAT(ends(controllerPath, {.associationClass = "TEST_Runs"}), ElementsAre("TEST_Firmware f1"));
  EXPECT_THAT(ends(firmwarePath, {.associationClass = "TEST_Runs"}), ElementsAre("TEST_Controller c"));
  EXPECT_THAT(ends(firmwarePath, {.associationClass = "test_INSTALLED"}),
              ElementsAre("TEST_System s", "TEST_Controller c"));
  EXPECT_THAT(
      ends(serverPath, {.associationClass = "TEST_Installed"}),
      ElementsAre("TEST_Firmware f1", "TEST_Firmware f2", R"(TEST_Software d "quoted" \ and, more=)"));
  EXPECT_THAT(ends(driverPath, {.associationClass = "TEST_Installed"}), ElementsAre("TEST_System s"));
  EXPECT_THAT(complaints(), IsEmpty());
}

TEST_F(Associators, takePathsWithTheirNamespace) {
  EXPECT_THAT(ends(R"(root/test:TEST_Port.Name="p")", {.associationClass = "TEST_Dependency"}),
              ElementsAre("TEST_Firmware f1"));
  EXPECT_THAT(ends(R"(//host/ROOT/test:test_port.NAME="p")", {.associationClass = "TEST_Dependency"}),
              ElementsAre("TEST_Firmware f1"));
}

// Each registered class is asked with its own name, in the order of the schema. TEST_HoldsKind and
// TEST_Unregistered are not registered; abstract classes are not asked.
TEST_F(Associators, ofAnAncestorComeFromEveryClassBelowIt) {
  EXPECT_THAT(associatorNames(firmwarePath, {.associationClass = "TEST_Dependency"}).objects,
              ElementsAre("TEST_Controller c", "TEST_Port p", "TEST_Firmware f2", "TEST_Firmware f3"));
  EXPECT_THAT(calls(), ElementsAre("associatorNames of=TEST_Runs", "associatorNames of=TEST_Serves",
                                   "associatorNames of=TEST_Holds", "associatorNames of=TEST_HoldsMore",
                                   "associatorNames of=TEST_Peer"));
  EXPECT_THAT(ends(firmwarePath, {.associationClass = "TEST_ElementSoftware"}),
              ElementsAre("TEST_Controller c", "TEST_Port p"));
}

TEST_F(Associators, ofNoClassComeFromEveryClass) {
  const Answer answer = associatorNames(portPath);
  EXPECT_THAT(answer.objects, ElementsAre("TEST_Firmware f1"));
  std::vector<std::string> expected;
  for (const char* name :
       {"Installed", "Runs", "Serves", "Holds", "HoldsMore", "Peer", "Remark", "Silent", "Broken",
        "AssociationOnly", "Circular", "FaultThrows", "FaultDenied", "FaultNulls", "FaultNoDone",
        "FaultStrange", "Endless", "FirstCrowd", "SecondCrowd"})
    expected.push_back("associatorNames of=TEST_" + std::string(name));
  EXPECT_EQ(calls(), expected);
}

TEST_F(Associators, areNoneWhereNobodyIsRegistered) {
  EXPECT_THAT(ends(serverPath, {.associationClass = "TEST_Unregistered"}), IsEmpty());
  EXPECT_THAT(ends(serverPath, {.associationClass = "TEST_HoldsKind"}), IsEmpty());
  EXPECT_THAT(calls(), IsEmpty());
}

// TEST_Holds delivers one object twice, and the object of TEST_HoldsMore, which is asked for it again.
TEST_F(Associators, areNotRepeatedByAnotherClass) {
  EXPECT_THAT(ends(serverPath, {.associationClass = "TEST_Holds"}),
              ElementsAre("TEST_Firmware f2", "TEST_Firmware f2", "TEST_Port kind", "TEST_Port more"));
  EXPECT_THAT(ends(serverPath, {.associationClass = "TEST_Dependency"}),
              ElementsAre("TEST_Firmware f2", "TEST_Firmware f2", "TEST_Port kind", "TEST_Port more"));
  const Answer all = associatorNames(serverPath);
  EXPECT_THAT(all.objects, testing::Contains("TEST_Firmware f2").Times(1));
  EXPECT_THAT(all.objects, testing::Contains("TEST_Port more").Times(1));
  EXPECT_EQ(all.outcome.delivered, all.objects.size());
}

// Were each object held against all the others, this would take minutes.
TEST_F(Associators, areHeldAgainstManyInLittleTime) {
  constexpr std::size_t crowd = 20000;
  const Answer answer = associatorNames(R"(TEST_System.Name="many")", {.associationClass = "TEST_Crowd"});
  EXPECT_EQ(answer.outcome.delivered, crowd);
  EXPECT_TRUE(answer.outcome.done);
}

TEST_F(Associators, haveThePropertiesAskedFor) {
  std::size_t count = 0;
  manager_.associators(firmwarePath, {.associationClass = "TEST_Runs"}, {{"nothing"}},
                       [&count](const cimom::Instance& instance) {
                         EXPECT_EQ(instance.find("Number"), nullptr);
                         count += instance.properties().size();
                         return true;
                       });
  manager_.associators(firmwarePath, {.associationClass = "TEST_Runs"}, {{"NUMBER"}},
                       [&count](const cimom::Instance& instance) {
                         EXPECT_NE(instance.find("Number"), nullptr);
                         count += instance.properties().size();
                         return true;
                       });
  EXPECT_EQ(count, 3U);
  EXPECT_THAT(calls(),
              ElementsAre("associators of=TEST_Runs first=nothing", "associators of=TEST_Runs first=NUMBER"));
}

TEST_F(Associators, endWhereTheSinkHasEnough) {
  std::size_t count = 0;
  const auto outcome =
      manager_.associatorNames(serverPath, {.associationClass = ""}, [&count](const cimom::ObjectPath&) {
        ++count;
        return false;
      });
  EXPECT_EQ(count, 1U);
  EXPECT_EQ(outcome.delivered, 1U);
  EXPECT_EQ(outcome.status.code, CMPI_RC_OK);
  EXPECT_THAT(calls(), ElementsAre("associatorNames of=TEST_Installed"));
}

TEST_F(Associators, throwWhatTheSinkThrows) {
  const auto sink = [](const cimom::ObjectPath&) -> bool { throw std::logic_error("no room"); };
  EXPECT_THROW(manager_.associatorNames(serverPath, {}, sink), std::logic_error);
  EXPECT_THAT(calls(), ElementsAre("associatorNames of=TEST_Installed"));
}

TEST_F(Associators, refuseWhatMakesNoRequest) {
  constexpr CMPIrc invalid = CMPI_RC_ERR_INVALID_PARAMETER;
  expectStatus(invalid, "column", "TEST_System.Name=");
  expectStatus(invalid, "key Name of class TEST_System is missing", "TEST_System");
  expectStatus(invalid, "no key Other", R"(TEST_System.Name="s",Other="x")");
  expectStatus(invalid, "TEST_None", R"(TEST_None.Name="s")");
  expectStatus(invalid, "TEST_None", serverPath, {.associationClass = "TEST_None"});
  expectStatus(invalid, "TEST_Port is no association", serverPath, {.associationClass = "TEST_Port"});
  expectStatus(CMPI_RC_ERR_INVALID_NAMESPACE, "root/none", R"(root/none:TEST_System.Name="s")");
  const Answer answer = associators(serverPath, {.resultClass = "TEST_None"});
  EXPECT_EQ(answer.outcome.status.code, invalid);
  EXPECT_THAT(answer.outcome.status.description, HasSubstr("TEST_None"));
  EXPECT_THAT(calls(), IsEmpty());
}

TEST_F(Associators, ofAnObjectThatIsNotThereAreNone) {
  EXPECT_THAT(ends(R"(TEST_Port.Name="none")", {.associationClass = "TEST_Dependency"}), IsEmpty());
}

TEST(AssociationCleanUp, isCalledAtTheEnd) {
  association_test::Lines log;
  {
    cimom::ObjectManager manager(association_test::linkedConfiguration(log));
    manager.associatorNames(R"(TEST_Port.Name="p")", {"TEST_Serves", "", "", ""},
                            [](const cimom::ObjectPath&) { return true; });
    EXPECT_THAT(log.all(), ElementsAre("call: associatorNames of=TEST_Serves"));
  }
  EXPECT_THAT(log.all(), testing::Contains("call: association cleanup").Times(1));
}

}  // namespace
