// Several requests at once around open enumerations.
#include "Fixture.h"

#include <future>
#include <thread>
#include <utility>

namespace {

using protocol_test::className;
using protocol_test::Control;
using protocol_test::errorCode;
using protocol_test::Given;
using protocol_test::names;
using protocol_test::outParameter;
using protocol_test::Protocol;
using protocol_test::Recorded;
using protocol_test::request;
using protocol_test::text;
using testing::HasSubstr;
using testing::SizeIs;

class PullThreads : public Protocol {
 protected:
  PullThreads() {
    settings_.lookAhead = std::chrono::milliseconds(0);
    restart();
  }

  std::string open() const {
    const Recorded answer = send(request(
        "OpenEnumerateInstances", {{"ClassName", className("TEST_Crowd")}, {"MaxObjectCount", text("0")}}));
    return outParameter(answer.body, "EnumerationContext");
  }
  static std::vector<Given> pulling(const std::string& id, const std::string& most) {
    return {{"EnumerationContext", text(id)}, {"MaxObjectCount", text(most)}};
  }

  /// A pull that waits for a provider that waits. Returns when it has taken the first object.
  std::thread startPull(const std::string& id, Recorded& answer) {
    std::promise<void> taken;
    auto isTaken = taken.get_future();
    answer.onWrite = [&taken, first = true]() mutable {
      if (std::exchange(first, false))
        taken.set_value();
    };
    std::thread thread([this, id, &answer] {
      endpoint_->handle(request("PullInstancesWithPath", pulling(id, "10")), answer);
    });
    isTaken.wait();
    return thread;
  }
};

TEST_F(PullThreads, oneAtATimeForEachEnumeration) {
  control_.set(&Control::allowed, 1);
  const std::string id = open();
  Recorded first;
  std::thread thread = startPull(id, first);
  EXPECT_THAT(expectError(21, "PullInstancesWithPath", pulling(id, "1")), HasSubstr("another request"));
  EXPECT_THAT(expectError(21, "EnumerationCount", {{"EnumerationContext", text(id)}}),
              HasSubstr("another request"));
  control_.set(&Control::allowed, Control::all);
  thread.join();
  EXPECT_THAT(names(first.body), SizeIs(3));
}

TEST_F(PullThreads, closingAbandonsAPull) {
  control_.set(&Control::allowed, 1);
  const std::string id = open();
  Recorded pull;
  std::thread thread = startPull(id, pull);
  ask("CloseEnumeration", {{"EnumerationContext", text(id)}});
  thread.join();
  EXPECT_TRUE(pull.failed);
  ASSERT_THAT(pull.trailers, SizeIs(2));
  EXPECT_EQ(pull.trailers[0].value, "23");
  EXPECT_EQ(endpoint_->contexts(), 0U);
  control_.set(&Control::allowed, Control::all);
}

TEST_F(PullThreads, closingAbandonsAPullThatHasNothingYet) {
  control_.set(&Control::allowed, 0);
  const std::string id = open();
  Recorded pull;
  std::thread thread([&] { endpoint_->handle(request("PullInstancesWithPath", pulling(id, "10")), pull); });
  // Refused while the pull holds the enumeration, and not before: then it is closed.
  while (errorCode(send(request("EnumerationCount", {{"EnumerationContext", text(id)}})).body) != 21)
    std::this_thread::yield();
  ask("CloseEnumeration", {{"EnumerationContext", text(id)}});
  thread.join();
  EXPECT_FALSE(pull.failed);
  EXPECT_EQ(errorCode(pull.body), 23);
  control_.set(&Control::allowed, Control::all);
}

TEST_F(PullThreads, aShutdownEndsPullsThatWait) {
  control_.set(&Control::allowed, 1);
  const std::string id = open();
  Recorded pull;
  std::thread thread = startPull(id, pull);
  endpoint_->shutDown();
  thread.join();
  EXPECT_TRUE(pull.failed);
  ASSERT_THAT(pull.trailers, SizeIs(2));
  EXPECT_EQ(pull.trailers[0].value, "28");
  control_.set(&Control::allowed, Control::all);
}

// An enumeration that is used does not expire, however long its provider takes.
TEST_F(PullThreads, aPullThatWaitsDoesNotExpire) {
  control_.set(&Control::allowed, 1);
  const std::string id = open();
  Recorded pull;
  std::thread thread = startPull(id, pull);
  passed_ = 2 * settings_.idleTime;
  ask("EnumerateInstanceNames", {{"ClassName", className("TEST_Item")}});
  open();  // looks for what has expired
  control_.set(&Control::allowed, Control::all);
  thread.join();
  EXPECT_THAT(names(pull.body), SizeIs(3));
}

TEST_F(PullThreads, manyClientsAtOnce) {
  constexpr int clients = 8;
  constexpr int rounds = 20;
  control_.set(&Control::size, 50);
  settings_.waitingObjects = 3;
  settings_.contexts = std::size_t{8} * clients;  // closed ones count until their providers have returned
  restart();
  std::atomic<int> complete = 0;
  const auto client = [&](int number) {
    for (int round = 0; round < rounds; ++round) {
      const std::string id = open();
      std::size_t objects = 0;
      for (bool isEnd = false; !isEnd && (number + round) % 3 != 0;) {
        const std::string body = send(request("PullInstancesWithPath", pulling(id, "7"))).body;
        ASSERT_EQ(errorCode(body), -1) << body;
        objects += names(body).size();
        isEnd = outParameter(body, "EndOfSequence") == "TRUE";
      }
      if ((number + round) % 3 == 0)
        EXPECT_EQ(errorCode(send(request("CloseEnumeration", {{"EnumerationContext", text(id)}})).body), -1);
      else
        complete += objects == 50 ? 1 : 0;
    }
  };
  std::vector<std::thread> threads;
  for (int number = 0; number < clients; ++number)
    threads.emplace_back(client, number);
  for (std::thread& each : threads)
    each.join();
  int expected = 0;
  for (int turn = 0; turn < clients * rounds; ++turn)
    expected += (turn / rounds + turn % rounds) % 3 != 0 ? 1 : 0;
  EXPECT_EQ(complete, expected);
  EXPECT_EQ(endpoint_->contexts(), 0U);
}

}  // namespace
