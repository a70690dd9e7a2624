#include "Linked.h"

#include <cimom/ProviderCall.h>

#include <atomic>
#include <thread>

namespace {

using association_test::Answer;
using association_test::Linked;
using testing::AllOf;
using testing::Contains;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

class AssociationFaults : public Linked {
 protected:
  /// All four operations on the class fail like this; the description says why.
  void expectFailed(const char* className, CMPIrc code, const std::string& reason, std::size_t delivered) {
    const Query query{.associationClass = className};
    for (const Answer& answer : {associatorNames(serverPath, query), associators(serverPath, query),
                                 referenceNames(serverPath, query), references(serverPath, query)}) {
      EXPECT_EQ(answer.outcome.status.code, code);
      EXPECT_THAT(answer.outcome.status.description, HasSubstr(reason));
      EXPECT_FALSE(answer.outcome.done);
      EXPECT_EQ(answer.outcome.delivered, delivered);
    }
  }
  void expectComplaints(const char* className, const std::string& what) {
    EXPECT_THAT(complaints(), Contains(AllOf(HasSubstr(className), HasSubstr(what))).Times(4));
    EXPECT_EQ(complaints().size(), 4U);
  }
};

TEST_F(AssociationFaults, anExceptionIsAFailure) {
  expectFailed("TEST_FaultThrows", CMPI_RC_ERR_FAILED, "something broke", 1);
}

TEST_F(AssociationFaults, aStatusIsHandedOn) {
  expectFailed("TEST_FaultDenied", CMPI_RC_ERR_ACCESS_DENIED, "no entry", 1);
  EXPECT_THAT(complaints(), IsEmpty());
}

TEST_F(AssociationFaults, aTableWithoutFunctionsSupportsNothing) {
  expectFailed("TEST_FaultNoFunctions", CMPI_RC_ERR_NOT_SUPPORTED, "provider Empty", 0);
}

TEST_F(AssociationFaults, aMissingFactoryIsAFailure) {
  expectFailed("TEST_FaultNoFactory", CMPI_RC_ERR_FAILED, "has no factory Unknown_Create_AssociationMI", 0);
}

TEST_F(AssociationFaults, aMissingLibraryIsAFailure) {
  expectFailed("TEST_FaultMissing", CMPI_RC_ERR_FAILED, "libNoSuchLibrary.so", 0);
}

TEST_F(AssociationFaults, nullsAreLeftOut) {
  EXPECT_THAT(ends(serverPath, {.associationClass = "TEST_FaultNulls"}), ElementsAre("TEST_Software nulls"));
  EXPECT_EQ(links(serverPath, {.associationClass = "TEST_FaultNulls"}).size(), 1U);
  expectComplaints("TEST_FaultNulls", "with 1 nulls");
}

TEST_F(AssociationFaults, aMissingDoneMarkerIsSaid) {
  const Query query{.associationClass = "TEST_FaultNoDone"};
  for (const Answer& answer : {associatorNames(serverPath, query), associators(serverPath, query),
                               referenceNames(serverPath, query), references(serverPath, query)}) {
    EXPECT_EQ(answer.outcome.status.code, CMPI_RC_OK);
    EXPECT_FALSE(answer.outcome.done);
    EXPECT_EQ(answer.outcome.delivered, 1U);
  }
  expectComplaints("TEST_FaultNoDone", "no done marker");
}

TEST_F(AssociationFaults, pathsForInstancesAreLeftOut) {
  EXPECT_THAT(ends(serverPath, {.associationClass = "TEST_FaultStrange"}),
              ElementsAre("TEST_Software strange"));
  EXPECT_EQ(links(serverPath, {.associationClass = "TEST_FaultStrange"}).size(), 1U);
  expectComplaints("TEST_FaultStrange", "1 objects that nobody asked for, the first of class TEST_Port");
}

// The first failure is the exception, and everybody is asked.
TEST_F(AssociationFaults, doNotKeepOthersFromBeingAsked) {
  const Answer answer = associatorNames(serverPath, {.associationClass = "TEST_Fault"});
  EXPECT_EQ(answer.outcome.status.code, CMPI_RC_ERR_FAILED);
  EXPECT_THAT(answer.outcome.status.description, HasSubstr("something broke"));
  EXPECT_FALSE(answer.outcome.done);
  EXPECT_THAT(answer.objects,
              ElementsAre("TEST_Software thrown", "TEST_Software denied", "TEST_Software nulls",
                          "TEST_Software no done", "TEST_Software strange"));
}

TEST_F(AssociationFaults, aRequestThatAsksItselfIsEnded) {
  const Answer answer = associatorNames(serverPath, {.associationClass = "TEST_Endless"});
  EXPECT_EQ(answer.outcome.status.code, CMPI_RC_ERR_FAILED);
  EXPECT_THAT(answer.outcome.status.description, HasSubstr("more than 16 calls deep"));
  EXPECT_EQ(calls().size(), static_cast<std::size_t>(cimom::Nesting::deepest));
  EXPECT_THAT(ends(portPath, {.associationClass = "TEST_Serves"}), ElementsAre("TEST_Firmware f1"));
}

class AssociationUpcalls : public Linked {
 protected:
  /// What the asking provider is told.
  std::string told(const std::string& question) {
    std::string result;
    manager_.getInstance("TEST_Asker.Name=\"" + question + "\"", std::nullopt,
                         [&result](const cimom::Instance& instance) {
                           result = cimom::text(instance.find("Told")->data).value_or("nothing");
                           return true;
                         });
    return result;
  }
};

TEST_F(AssociationUpcalls, goTheSameWayWithTheContextOfTheAsker) {
  EXPECT_EQ(told("associators"), " instance TEST_Controller c");
  EXPECT_THAT(calls(), Contains("associators of=TEST_Runs result=TEST_Element role=Dependent "
                                "resultRole=Antecedent first=Number marked me"));
  EXPECT_EQ(told("associatorNames"), " path TEST_Controller c path TEST_Port p");
  EXPECT_THAT(calls(), Contains("associatorNames of=TEST_Serves marked me"));
  EXPECT_EQ(told("references"), " instance TEST_Runs ");
  EXPECT_THAT(calls(), Contains("references of=TEST_Runs role=Dependent marked me"));
  EXPECT_EQ(told("referenceNames"), " path TEST_Peer  path TEST_Peer ");
  EXPECT_THAT(complaints(), IsEmpty());
}

TEST_F(AssociationUpcalls, mayHaveAClassAsTheirSource) {
  EXPECT_EQ(told("class"), " path TEST_Port p");
  EXPECT_EQ(told("references of a class"), " path TEST_Installed ");
}

TEST_F(AssociationUpcalls, failAsRequestsOfClientsDo) {
  EXPECT_EQ(told("unknown"), "status 4: the schema has no association class TEST_None");
}

class AssociationThreads : public Linked {};

TEST_F(AssociationThreads, mayAskForRolesAtOnce) {
  constexpr int threadCount = 8;
  constexpr int rounds = 20;
  std::atomic<int> wrong = 0;
  std::vector<std::thread> threads;
  for (int index = 0; index < threadCount; ++index) {
    threads.emplace_back([this, &wrong] {
      for (int round = 0; round < rounds; ++round) {
        const bool right =
            associatorNames(firmwarePath, {.associationClass = "TEST_Dependency", .role = "Dependent"})
                    .outcome.delivered == 3 &&
            associators(serverPath, {.associationClass = "TEST_Holds"}).outcome.delivered == 4 &&
            references(firmwarePath, {.associationClass = "TEST_Peer", .role = "Dependent"})
                    .outcome.delivered == 1;
        wrong += right ? 0 : 1;
      }
    });
  }
  for (std::thread& thread : threads)
    thread.join();
  EXPECT_EQ(wrong, 0);
}

}  // namespace
