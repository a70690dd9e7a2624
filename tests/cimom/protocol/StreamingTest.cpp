// How answers go out: at once, in pieces, and how they end that cannot be completed.
#include "Fixture.h"

namespace {

using protocol_test::className;
using protocol_test::Control;
using protocol_test::errorCode;
using protocol_test::errorText;
using protocol_test::instanceName;
using protocol_test::names;
using protocol_test::Protocol;
using protocol_test::Recorded;
using protocol_test::request;
using protocol_test::Request;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::Not;
using testing::SizeIs;

class Streaming : public Protocol {
 protected:
  static Request instances(const std::string& name) {
    return request("EnumerateInstances", {{"ClassName", className(name)}});
  }
  Recorded sendWith(const Request& made, const std::function<void(Recorded&)>& prepare) const {
    Recorded answer;
    prepare(answer);
    endpoint_->handle(made, answer);
    return answer;
  }
};

TEST_F(Streaming, sendsTheFirstObjectBeforeTheProviderHasTheSecond) {
  control_.set(&Control::allowed, 1);
  std::size_t deliveredAtFirst = Control::all;
  const Recorded answer = sendWith(instances("TEST_Crowd"), [&](Recorded& each) {
    each.onWrite = [&] {
      if (deliveredAtFirst != Control::all)
        return;
      deliveredAtFirst = control_.get(&Control::delivered);
      control_.set(&Control::allowed, Control::all);
    };
  });
  EXPECT_EQ(deliveredAtFirst, 0U);  // the provider has not returned from handing over the first one
  EXPECT_THAT(names(answer.body), SizeIs(3));
}

TEST_F(Streaming, sendsInPieces) {
  settings_.pieceSize = 4096;
  restart();
  control_.set(&Control::size, 500);
  const Recorded answer = send(instances("TEST_Crowd"));
  EXPECT_THAT(names(answer.body), SizeIs(500));
  ASSERT_GT(answer.pieces.size(), 10U);
  std::size_t small = 0;
  for (const std::size_t piece : answer.pieces) {
    EXPECT_LE(piece, 3 * 4096U);
    small += piece < 4096 ? 1 : 0;
  }
  // The first and the last, and what a slow machine sends by the clock.
  EXPECT_LT(small, answer.pieces.size() / 2);
}

TEST_F(Streaming, keepsASingleObjectTogether) {
  const Recorded answer = send(request("GetInstance", {{"InstanceName", instanceName("TEST_Item", "a")}}));
  EXPECT_THAT(answer.pieces, SizeIs(1));
  EXPECT_FALSE(answer.has("Trailer"));
}

TEST_F(Streaming, endsTheDeliveryWhenTheClientIsGone) {
  control_.set(&Control::size, 100);
  const Recorded answer = sendWith(instances("TEST_Crowd"), [](Recorded& each) { each.takes = 1; });
  EXPECT_THAT(answer.pieces, SizeIs(1));
  EXPECT_FALSE(answer.failed);
  EXPECT_LT(names(answer.body).size(), 3U);
}

TEST_F(Streaming, tellsOfAnErrorBeforeTheFirstObjectInAnOrdinaryAnswer) {
  const Recorded answer = send(instances("TEST_Refused"));
  EXPECT_EQ(answer.status, 200);
  EXPECT_FALSE(answer.failed);
  EXPECT_EQ(errorCode(answer.body), 2);
}

TEST_F(Streaming, tellsOfALaterErrorInTheTrailers) {
  Request made = instances("TEST_LateFailing");
  made.takesTrailers = true;
  const Recorded answer = send(made);
  EXPECT_EQ(answer.status, 200);
  EXPECT_EQ(answer.field("Trailer"), "CIMStatusCode, CIMStatusCodeDescription");
  EXPECT_TRUE(answer.failed);
  EXPECT_THAT(answer.body, HasSubstr("TEST_LateFailing"));
  EXPECT_THAT(answer.body, Not(HasSubstr("</CIM>")));
  ASSERT_THAT(answer.trailers, SizeIs(2));
  EXPECT_EQ(answer.trailers[0].name, "CIMStatusCode");
  EXPECT_EQ(answer.trailers[0].value, "2");
  EXPECT_EQ(answer.trailers[1].name, "CIMStatusCodeDescription");
  EXPECT_EQ(answer.trailers[1].value, "no entry: 100%25%0A%C3%A4");
  EXPECT_THAT(log_.all(), ElementsAre(HasSubstr("EnumerateInstances breaks off with status 2")));
}

TEST_F(Streaming, announcesTrailersOnlyToWhoTakesThem) {
  const Recorded answer = send(instances("TEST_LateFailing"));
  EXPECT_TRUE(answer.failed);
  EXPECT_FALSE(answer.has("Trailer"));
}

TEST_F(Streaming, answersWithALateErrorAloneWhereNothingHasLeftYet) {
  const Recorded answer =
      sendWith(instances("TEST_LateFailing"), [](Recorded& each) { each.holdsBack = true; });
  EXPECT_EQ(answer.status, 200);
  EXPECT_FALSE(answer.failed);
  EXPECT_EQ(errorCode(answer.body), 2);
  EXPECT_THAT(errorText(answer.body), HasSubstr("no entry"));
  EXPECT_THAT(answer.body, Not(HasSubstr("INSTANCE")));
}

}  // namespace
