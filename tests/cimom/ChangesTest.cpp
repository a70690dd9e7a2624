#include "Operations.h"

#include <stdexcept>

namespace {

using cimom::Outcome;
using operations_test::Answer;
using operations_test::Operations;
using testing::ElementsAre;
using testing::IsEmpty;

class Changes : public Operations {
 protected:
  void expectStatus(const Outcome& outcome, CMPIrc code, const std::string& description) {
    EXPECT_EQ(outcome.status.code, code);
    EXPECT_EQ(outcome.status.description, description);
    EXPECT_FALSE(outcome.done);
    EXPECT_EQ(outcome.delivered, 0U);
    EXPECT_THAT(log_.all(), IsEmpty());
  }
};

TEST_F(Changes, createHandsTheInstanceToItsProvider) {
  const Answer answer = create(*instance(R"(TEST_Record.Name="a")", 5));
  EXPECT_EQ(answer.outcome.status.code, CMPI_RC_OK) << answer.outcome.status.description;
  EXPECT_TRUE(answer.outcome.done);
  EXPECT_EQ(answer.outcome.delivered, 1U);
  EXPECT_THAT(answer.objects, ElementsAre(R"(root/test:TEST_Record.Name="made for a")"));
  EXPECT_THAT(log_.all(), ElementsAre("call: create root/test:TEST_Record.Name=\"a\" of "
                                      "root/test:TEST_Record.Name=\"a\" Name=a Number=5"));
}

// A client names a new instance by its properties alone, or leaves the name to the provider.
TEST_F(Changes, createNeedsNoKeys) {
  EXPECT_EQ(create(*instance("TEST_Record", 5)).outcome.status.code, CMPI_RC_OK);
  EXPECT_THAT(log_.all(),
              ElementsAre("call: create root/test:TEST_Record of root/test:TEST_Record Number=5"));
}

TEST_F(Changes, createGoesToTheNamespaceOfTheRequest) {
  EXPECT_EQ(create(*instance(R"(root/other:TEST_Record.Name="a")", 5), "/root/TEST").outcome.status.code,
            CMPI_RC_OK);
  EXPECT_THAT(log_.all(), ElementsAre("call: create root/TEST:TEST_Record.Name=\"a\" of "
                                      "root/TEST:TEST_Record.Name=\"a\" Name=a Number=5"));
}

TEST_F(Changes, createPassesOnTheProvidersStatus) {
  const Answer answer = create(*instance(R"(TEST_Record.Name="known")", 5));
  EXPECT_EQ(answer.outcome.status.code, CMPI_RC_ERR_ALREADY_EXISTS);
  EXPECT_EQ(answer.outcome.status.description, "it is there");
  EXPECT_THAT(answer.objects, IsEmpty());
}

TEST_F(Changes, createWithoutTheDoneMarkerIsCounted) {
  const Answer answer = create(*instance(R"(TEST_Record.Name="no done")", 5));
  EXPECT_EQ(answer.outcome.status.code, CMPI_RC_OK);
  EXPECT_FALSE(answer.outcome.done);
  EXPECT_THAT(answer.objects, ElementsAre(R"(root/test:TEST_Record.Name="made for no done")"));
  EXPECT_EQ(manager_.unfinishedAnswers(), 1U);
}

TEST_F(Changes, createIsRefusedWhereNobodyCouldAnswer) {
  expectStatus(create(*instance(R"(TEST_Record.Name="a")", 5), "root/none").outcome,
               CMPI_RC_ERR_INVALID_NAMESPACE, "no class is registered in namespace 'root/none'");
  expectStatus(create(*cimom::Instance::create(arena_, *path("TEST_Unserved"))).outcome,
               CMPI_RC_ERR_NOT_SUPPORTED, "no provider is registered for class TEST_Unserved");
  expectStatus(create(*cimom::Instance::create(arena_, *path("TEST_Idle"))).outcome,
               CMPI_RC_ERR_NOT_SUPPORTED, "provider Idle has no function for this request");
}

TEST_F(Changes, createRefusesKeysThatTheClassCannotHave) {
  cimom::ObjectPath* wrong = path("TEST_Record");
  CMPIValue number;
  number.uint32 = 7;
  ASSERT_EQ(wrong->addKey("Name", &number, CMPI_uint32), CMPI_RC_OK);
  expectStatus(create(*cimom::Instance::create(arena_, *wrong)).outcome, CMPI_RC_ERR_INVALID_PARAMETER,
               "key Name of class TEST_Record has the wrong type");
}

TEST_F(Changes, whatTheSinkThrowsComesThrough) {
  const auto refuse = [](const cimom::ObjectPath&) -> bool { throw std::runtime_error("enough"); };
  EXPECT_THROW(manager_.createInstance("root/test", *instance(R"(TEST_Record.Name="a")", 5), refuse),
               std::runtime_error);
}

TEST_F(Changes, modifyHandsTheInstanceAndTheListToItsProvider) {
  const Outcome all =
      manager_.modifyInstance(*instance(R"(root/test:TEST_Record.Name="a")", 5), std::nullopt);
  EXPECT_EQ(all.status.code, CMPI_RC_OK);
  EXPECT_TRUE(all.done);
  const Outcome some = manager_.modifyInstance(*instance(R"(TEST_Record.Name="a")", 5),
                                               std::vector<std::string>{"Number", "x"});
  EXPECT_EQ(some.status.code, CMPI_RC_OK);
  const Outcome none =
      manager_.modifyInstance(*instance(R"(TEST_Record.Name="a")", 5), std::vector<std::string>{});
  EXPECT_EQ(none.status.code, CMPI_RC_OK);
  EXPECT_THAT(log_.all(),
              ElementsAre(R"(call: modify root/test:TEST_Record.Name="a" Name=a Number=5)",
                          R"(call: modify root/test:TEST_Record.Name="a" Name=a Number=5 only Number x)",
                          R"(call: modify root/test:TEST_Record.Name="a" Name=a Number=5 only)"));
}

TEST_F(Changes, modifyPassesOnTheProvidersStatus) {
  const Outcome outcome = manager_.modifyInstance(*instance(R"(TEST_Record.Name="known")", 5), std::nullopt);
  EXPECT_EQ(outcome.status.code, CMPI_RC_ERR_NO_SUCH_PROPERTY);
  EXPECT_EQ(outcome.status.description, "not that one");
}

TEST_F(Changes, modifyIsRefusedWhereNoInstanceIsNamed) {
  expectStatus(manager_.modifyInstance(*instance(R"(root/none:TEST_Record.Name="a")", 5), std::nullopt),
               CMPI_RC_ERR_INVALID_NAMESPACE, "no class is registered in namespace 'root/none'");
  expectStatus(manager_.modifyInstance(*instance("TEST_Record", 5), std::nullopt),
               CMPI_RC_ERR_INVALID_PARAMETER, "key Name of class TEST_Record is missing");
  expectStatus(
      manager_.modifyInstance(*cimom::Instance::create(arena_, *path(R"(TEST_Pair.Name="a")")), std::nullopt),
      CMPI_RC_ERR_INVALID_PARAMETER, "key Place of class TEST_Pair is missing");
  expectStatus(
      manager_.modifyInstance(*cimom::Instance::create(arena_, *path(R"(TEST_Idle.Name="a")")), std::nullopt),
      CMPI_RC_ERR_NOT_SUPPORTED, "provider Idle has no function for this request");
}

TEST_F(Changes, deleteGoesToTheProvider) {
  EXPECT_EQ(manager_.deleteInstance(*path(R"(TEST_Record.Name="a")")).status.code, CMPI_RC_OK);
  const Outcome gone = manager_.deleteInstance(*path(R"(root/test:TEST_Record.Name="gone")"));
  EXPECT_EQ(gone.status.code, CMPI_RC_ERR_NOT_FOUND);
  EXPECT_EQ(gone.status.description, "not here");
  EXPECT_THAT(log_.all(), ElementsAre(R"(call: delete root/test:TEST_Record.Name="a")",
                                      R"(call: delete root/test:TEST_Record.Name="gone")"));
}

TEST_F(Changes, deleteIsRefusedWhereNoInstanceIsNamed) {
  expectStatus(manager_.deleteInstance(*path(R"(root/none:TEST_Record.Name="a")")),
               CMPI_RC_ERR_INVALID_NAMESPACE, "no class is registered in namespace 'root/none'");
  expectStatus(manager_.deleteInstance(*path(R"(TEST_None.Name="a")")), CMPI_RC_ERR_INVALID_CLASS,
               "the schema has no class TEST_None");
  expectStatus(manager_.deleteInstance(*path("TEST_Record")), CMPI_RC_ERR_INVALID_PARAMETER,
               "key Name of class TEST_Record is missing");
  expectStatus(manager_.deleteInstance(*path(R"(TEST_Idle.Name="a")")), CMPI_RC_ERR_NOT_SUPPORTED,
               "provider Idle has no function for this request");
}

}  // namespace
