#include "Asked.h"

namespace {

using dispatch_test::Answer;
using dispatch_test::Dispatch;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

class GetInstance : public Dispatch {
 protected:
  void expectNotFound(std::string_view path, std::string_view reason) {
    const Answer answer = get(path);
    EXPECT_EQ(answer.outcome.status.code, CMPI_RC_ERR_NOT_FOUND);
    EXPECT_THAT(answer.outcome.status.description, HasSubstr(std::string(reason)));
    EXPECT_THAT(answer.objects, IsEmpty());
    EXPECT_EQ(answer.outcome.delivered, 0U);
    EXPECT_THAT(log_.all(),
                testing::Contains(testing::AllOf(HasSubstr(std::string(reason)), HasSubstr("TEST_Thing"))));
  }

  void expectInvalid(std::string_view path, std::string_view reason) {
    const Answer answer = get(path);
    EXPECT_EQ(answer.outcome.status.code, CMPI_RC_ERR_INVALID_PARAMETER) << path;
    EXPECT_THAT(answer.outcome.status.description, HasSubstr(std::string(reason)));
    EXPECT_THAT(answer.objects, IsEmpty());
  }
};

TEST_F(GetInstance, deliversTheOneThatWasAskedFor) {
  const Answer answer = get("root/test:TEST_Thing.Name=\"a\"");
  EXPECT_EQ(answer.outcome.status.code, CMPI_RC_OK);
  EXPECT_TRUE(answer.outcome.done);
  EXPECT_EQ(answer.outcome.delivered, 1U);
  EXPECT_THAT(answer.objects, ElementsAre("TEST_Thing a 1"));
  EXPECT_THAT(log_.all(), IsEmpty());
  EXPECT_THAT(get("TEST_THING.name=\"a\"").objects, ElementsAre("TEST_Thing a 1"));
}

TEST_F(GetInstance, appliesPropertyLists) {
  EXPECT_THAT(get("TEST_Thing.Name=\"a\"", {{"Text"}}).objects, ElementsAre("TEST_Thing a"));
}

TEST_F(GetInstance, findsNothingInAnAnswerOfNone) {
  expectNotFound("TEST_Thing.Name=\"none\"", "no instance");
}

TEST_F(GetInstance, findsNothingInAnAnswerOfNoneWithoutADoneMarker) {
  expectNotFound("TEST_Thing.Name=\"gone\"", "no instance and no done marker");
}

TEST_F(GetInstance, findsNothingInAnAnswerOfTwo) {
  expectNotFound("TEST_Thing.Name=\"two\"", "2 objects where one was asked for");
}

TEST_F(GetInstance, findsNothingInAnotherInstance) {
  expectNotFound("TEST_Thing.Name=\"other\"", "TEST_Thing.Name=\"another\"");
}

TEST_F(GetInstance, findsNothingInAPath) {
  expectNotFound("TEST_Thing.Name=\"path\"", "a path where an instance was asked for");
}

TEST_F(GetInstance, leavesNullsOut) {
  EXPECT_THAT(get("TEST_Thing.Name=\"null\"").objects, ElementsAre("TEST_Thing null 1"));
}

TEST_F(GetInstance, passesOnAnAnswerWithoutADoneMarker) {
  const Answer answer = get("TEST_Thing.Name=\"no done\"");
  EXPECT_EQ(answer.outcome.status.code, CMPI_RC_OK);
  EXPECT_FALSE(answer.outcome.done);
  EXPECT_THAT(answer.objects, ElementsAre("TEST_Thing no done 1"));
  EXPECT_THAT(log_.all(), ElementsAre(HasSubstr("no done marker")));
  EXPECT_EQ(manager_.unfinishedAnswers(), 1U);
}

TEST_F(GetInstance, passesOnAFailure) {
  const Answer answer = get("TEST_Thing.Name=\"failing\"");
  EXPECT_EQ(answer.outcome.status.code, CMPI_RC_ERR_ACCESS_DENIED);
  EXPECT_EQ(answer.outcome.status.description, "no entry");
}

TEST_F(GetInstance, holdsKeysAgainstTheClass) {
  expectInvalid("TEST_Thing", "key Name of class TEST_Thing is missing");
  expectInvalid("TEST_Thing.Text=\"a\"", "Name");
  expectInvalid("TEST_Thing.Name=\"a\",Text=\"b\"", "class TEST_Thing has no key Text");
  expectInvalid("TEST_Thing.Name=\"a\",None=\"b\"", "class TEST_Thing has no key None");
  expectInvalid("TEST_Thing.Name=5", "");
  expectInvalid("TEST_Thing.Name=true", "");
  expectInvalid("TEST_Link.One=\"TEST_Thing.Name=\\\"a\\\"\",Number=\"1\"", "");
  expectInvalid("TEST_Link.One=5,Number=1", "");
}

TEST_F(GetInstance, refusesATextThatIsNoPath) {
  expectInvalid("TEST_Thing.Name=\"a", "");
  expectInvalid("", "");
}

TEST_F(GetInstance, refusesWhatItDoesNotKnow) {
  EXPECT_EQ(get("root/none:TEST_Thing.Name=\"a\"").outcome.status.code, CMPI_RC_ERR_INVALID_NAMESPACE);
  EXPECT_EQ(get("TEST_None.Name=\"a\"").outcome.status.code, CMPI_RC_ERR_INVALID_CLASS);
  EXPECT_EQ(get("TEST_Unserved.Name=\"a\"").outcome.status.code, CMPI_RC_ERR_NOT_SUPPORTED);
  EXPECT_EQ(get("TEST_Link.One=\"TEST_Thing.Name=\\\"a\\\"\",Number=1").outcome.status.code,
            CMPI_RC_ERR_NOT_SUPPORTED);
  EXPECT_EQ(get("TEST_Empty.Name=\"a\"").outcome.status.code, CMPI_RC_ERR_NOT_SUPPORTED);
  EXPECT_EQ(get("TEST_Missing.Name=\"a\"").outcome.status.code, CMPI_RC_ERR_FAILED);
}

}  // namespace
