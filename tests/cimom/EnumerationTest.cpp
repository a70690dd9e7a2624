#include "Asked.h"

#include <stdexcept>

namespace {

using cimom::Instance;
using dispatch_test::Answer;
using dispatch_test::Dispatch;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::UnorderedElementsAre;

class Enumeration : public Dispatch {};

TEST_F(Enumeration, handsOverWhatTheProviderReturns) {
  const Answer answer = instances("TEST_SubThing");
  EXPECT_EQ(answer.outcome.status.code, CMPI_RC_OK);
  EXPECT_TRUE(answer.outcome.done);
  EXPECT_EQ(answer.outcome.delivered, 1U);
  EXPECT_THAT(answer.objects, ElementsAre("TEST_SubThing s 4"));
  EXPECT_THAT(log_.all(), IsEmpty());
}

TEST_F(Enumeration, ignoresTheCaseOfNames) {
  EXPECT_THAT(instances("test_SUBTHING", std::nullopt, "ROOT/Test").objects,
              ElementsAre("TEST_SubThing s 4"));
}

// The provider of TEST_Thing also returns an instance of TEST_SubThing, whose own provider is asked for it.
TEST_F(Enumeration, coversSubclassesAndDeliversEachInstanceOnce) {
  const Answer answer = instances("TEST_Thing");
  EXPECT_THAT(answer.objects,
              UnorderedElementsAre("TEST_Thing a 1", "TEST_Thing b 2", "TEST_Kind k 3", "TEST_SubThing s 4"));
  EXPECT_EQ(answer.outcome.delivered, 4U);
  EXPECT_TRUE(answer.outcome.done);
  EXPECT_THAT(log_.all(), IsEmpty());
  EXPECT_THAT(names("TEST_Thing").objects,
              UnorderedElementsAre("TEST_Thing a", "TEST_Thing b", "TEST_Kind k", "TEST_SubThing s"));
}

// In this namespace nobody else serves TEST_SubThing.
TEST_F(Enumeration, goesByTheRegistrationsOfTheNamespace) {
  EXPECT_EQ(instances("TEST_Thing", std::nullopt, "root/other").outcome.delivered, 4U);
  EXPECT_EQ(instances("TEST_SubThing", std::nullopt, "root/other").outcome.status.code,
            CMPI_RC_ERR_NOT_SUPPORTED);
}

TEST_F(Enumeration, takesTheNamespaceOfTheClassWhereNoneIsGiven) {
  EXPECT_EQ(instances("TEST_Echo", std::nullopt, "").outcome.delivered, 1U);
  EXPECT_EQ(instances("TEST_Echo", std::nullopt, "/root/test").outcome.delivered, 1U);
}

TEST_F(Enumeration, ofAnAncestorIsNotEndedByOneFailure) {
  const Answer answer = instances("TEST_Element");
  EXPECT_NE(answer.outcome.status.code, CMPI_RC_OK);
  EXPECT_NE(answer.outcome.status.description, "");
  EXPECT_FALSE(answer.outcome.done);
  EXPECT_THAT(answer.objects, testing::IsSupersetOf({"TEST_Thing a 1", "TEST_SubThing s 4",
                                                     "TEST_Failing first 1", "TEST_Untidy s 4"}));
}

TEST_F(Enumeration, refusesWhatItDoesNotKnow) {
  const Answer space = instances("TEST_Thing", std::nullopt, "root/none");
  EXPECT_EQ(space.outcome.status.code, CMPI_RC_ERR_INVALID_NAMESPACE);
  EXPECT_THAT(space.outcome.status.description, HasSubstr("root/none"));
  const Answer type = instances("TEST_None");
  EXPECT_EQ(type.outcome.status.code, CMPI_RC_ERR_INVALID_CLASS);
  EXPECT_THAT(type.outcome.status.description, HasSubstr("TEST_None"));
  const Answer unserved = instances("TEST_Unserved");
  EXPECT_EQ(unserved.outcome.status.code, CMPI_RC_ERR_NOT_SUPPORTED);
  EXPECT_FALSE(unserved.outcome.done);
  EXPECT_EQ(instances("TEST_Link").outcome.status.code, CMPI_RC_ERR_NOT_SUPPORTED);
  EXPECT_EQ(instances("TEST_Empty").outcome.status.code, CMPI_RC_ERR_NOT_SUPPORTED);
  EXPECT_EQ(names("TEST_Empty").outcome.status.code, CMPI_RC_ERR_NOT_SUPPORTED);
}

TEST_F(Enumeration, keepsWhatCameBeforeAFailure) {
  const Answer answer = instances("TEST_Failing");
  EXPECT_EQ(answer.outcome.status.code, CMPI_RC_ERR_ACCESS_DENIED);
  EXPECT_EQ(answer.outcome.status.description, "no entry");
  EXPECT_FALSE(answer.outcome.done);
  EXPECT_THAT(answer.objects, ElementsAre("TEST_Failing first 1"));
}

TEST_F(Enumeration, makesAFailureOfAProvidersException) {
  const Answer answer = instances("TEST_Throwing");
  EXPECT_EQ(answer.outcome.status.code, CMPI_RC_ERR_FAILED);
  EXPECT_THAT(answer.outcome.status.description, HasSubstr("something broke"));
  EXPECT_EQ(answer.outcome.delivered, 1U);
}

TEST_F(Enumeration, saysThatTheDoneMarkerIsMissing) {
  const Answer answer = instances("TEST_NoDone");
  EXPECT_EQ(answer.outcome.status.code, CMPI_RC_OK);
  EXPECT_FALSE(answer.outcome.done);
  EXPECT_THAT(answer.objects, ElementsAre("TEST_NoDone first 1"));
  EXPECT_THAT(log_.all(),
              ElementsAre(HasSubstr("provider TestProvider stopped early: for class TEST_NoDone")));
  EXPECT_EQ(manager_.unfinishedAnswers(), 1U);
  instances("TEST_NoDone");
  instances("TEST_Thing");
  instances("TEST_Failing");
  EXPECT_EQ(manager_.unfinishedAnswers(), 2U);
}

TEST_F(Enumeration, leavesNullsOut) {
  const Answer answer = instances("TEST_Nulls");
  EXPECT_EQ(answer.outcome.status.code, CMPI_RC_OK);
  EXPECT_TRUE(answer.outcome.done);
  EXPECT_THAT(answer.objects, ElementsAre("TEST_Nulls first 1", "TEST_Nulls second 2"));
  EXPECT_THAT(log_.all(), ElementsAre(HasSubstr("with 1 nulls")));
}

TEST_F(Enumeration, leavesOutWhatNobodyAskedFor) {
  const Answer answer = instances("TEST_Strange");
  EXPECT_THAT(answer.objects, ElementsAre("TEST_Strange second 2"));
  EXPECT_THAT(log_.all(), testing::Contains(
                              HasSubstr("1 objects that nobody asked for, the first of class TEST_NoDone")));
}

TEST_F(Enumeration, appliesPropertyLists) {
  std::size_t count = 0;
  manager_.enumerateInstances("root/test", "TEST_SubThing", {{"tExT", "NoProperty"}},
                              [&](const Instance& instance) {
                                EXPECT_NE(instance.find("Text"), nullptr);
                                EXPECT_NE(instance.find("Name"), nullptr);
                                EXPECT_EQ(instance.find("Number"), nullptr);
                                count += instance.properties().size();
                                return true;
                              });
  EXPECT_EQ(count, 2U);
  EXPECT_THAT(instances("TEST_SubThing", std::vector<std::string>()).objects, ElementsAre("TEST_SubThing s"));
}

TEST_F(Enumeration, endsDeliveryWhereTheSinkHasEnough) {
  std::size_t calls = 0;
  const auto outcome =
      manager_.enumerateInstances("root/test", "TEST_Thing", std::nullopt, [&calls](const Instance&) {
        ++calls;
        return false;
      });
  EXPECT_EQ(calls, 1U);
  EXPECT_EQ(outcome.delivered, 1U);
  EXPECT_EQ(outcome.status.code, CMPI_RC_OK);
}

TEST_F(Enumeration, throwsWhatTheSinkThrowsOnceTheProviderHasReturned) {
  std::size_t calls = 0;
  const auto sink = [&calls](const Instance&) -> bool {
    ++calls;
    throw std::logic_error("no room");
  };
  EXPECT_THROW(manager_.enumerateInstances("root/test", "TEST_Thing", std::nullopt, sink), std::logic_error);
  EXPECT_EQ(calls, 1U);
  EXPECT_EQ(instances("TEST_SubThing").outcome.delivered, 1U);
}

TEST_F(Enumeration, passesOnWhatAProviderLogs) {
  instances("TEST_Logging");
  EXPECT_THAT(log_.all(), ElementsAre("part: said by the provider"));
}

}  // namespace
