// What becomes of a tree, and of a failure to read one, when its time is over.
#include "TestSource.h"

#include <agent/framework/InventoryFile.h>
#include <agent/framework/TreeStore.h>

#include <Oru/Exceptions.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <atomic>
#include <chrono>
#include <filesystem>
#include <fstream>
#include <functional>
#include <future>
#include <memory>
#include <stdexcept>
#include <string>
#include <thread>
#include <vector>

#include <unistd.h>

namespace agent {
namespace {

using namespace std::chrono_literals;
using ::testing::HasSubstr;
using Time = std::chrono::steady_clock::time_point;

NodeTree treeOf(std::string_view description) {
  NodeTreeBuilder builder;
  builder.add(NodeTreeBuilder::noParent, Oru::NodeLexicon::FirmwareNode, "x", description);
  return builder.build();
}

class TreeStoreLifetime : public ::testing::Test {
 protected:
  static constexpr auto lifetime = TreeStore::usualLifetime;

  void SetUp() override { testing::takeLog(); }

  /// Ends the store, and with it the reading under way.
  void TearDown() override {
    store.reset();
    testing::setSource(nullptr);
  }

  void pass(std::chrono::seconds time) { seconds += time.count(); }

  /// Reads `source` from now on, and counts how often.
  void setSource(const std::function<NodeTree()>& source) {
    testing::setSource([this, source] {
      ++reads;
      return source();
    });
  }

  std::string description() { return std::string(store->current()->description(0)); }

  std::string failure() {
    try {
      store->current();
    } catch (const Oru::InstrumentationException& error) {
      return error.what();
    }
    return {};
  }

  /// Lets the time pass, has a request start the re-reading, and waits for its end.
  void askAfterTheTime() {
    pass(60s);
    store->current();
    store->waitForRereading();
  }

  std::atomic<std::int64_t> seconds = 1000;
  std::atomic<int> reads = 0;
  std::unique_ptr<TreeStore> store =
      std::make_unique<TreeStore>(lifetime, [this] { return Time(std::chrono::seconds(seconds.load())); });
};

TEST_F(TreeStoreLifetime, IsAMinute) {
  EXPECT_EQ(TreeStore::usualLifetime, 60s);
}

TEST_F(TreeStoreLifetime, ChangedInventoryFileShowsAfterTheTime) {
  const std::filesystem::path file =
      std::filesystem::temp_directory_path() / ("swinv-changing-" + std::to_string(getpid()) + ".json");
  std::ofstream(file) << writeInventory(treeOf("before"));
  setSource([file] { return readInventoryFile(file); });
  const auto before = store->current();
  EXPECT_EQ(before->description(0), "before");

  std::ofstream(file, std::ios::trunc) << writeInventory(treeOf("after"));
  pass(59s);
  EXPECT_EQ(description(), "before");
  EXPECT_EQ(reads, 1);
  pass(1s);
  EXPECT_EQ(description(), "before") << "the request that starts the reading does not wait for it";
  store->waitForRereading();
  EXPECT_EQ(description(), "after");
  EXPECT_EQ(reads, 2);
  EXPECT_EQ(before->description(0), "before") << "a request under way keeps its tree";
  EXPECT_TRUE(testing::takeLog().empty());
  std::filesystem::remove(file);
}

TEST_F(TreeStoreLifetime, RequestsDoNotWaitForTheReadingAndStartOneAtATime) {
  setSource([] { return treeOf("before"); });
  EXPECT_EQ(description(), "before");
  std::promise<void> release;
  setSource([gate = release.get_future().share()] {
    gate.wait();
    return treeOf("after");
  });
  pass(60s);
  std::vector<std::thread> requests;
  std::atomic<int> others = 0;
  for (int i = 0; i < 8; ++i) {
    requests.emplace_back([this, &others] { others += description() == "before" ? 0 : 1; });
  }
  for (std::thread& request : requests) {
    request.join();  // while the reading still hangs
  }
  pass(600s);
  EXPECT_EQ(description(), "before");
  EXPECT_EQ(others, 0);
  release.set_value();
  store->waitForRereading();
  EXPECT_EQ(description(), "after");
  EXPECT_EQ(reads, 2) << "the time counts from the end of a reading";
}

TEST_F(TreeStoreLifetime, EqualTreeLeavesTheEarlierOneInPlace) {
  setSource([] { return treeOf("same"); });
  const auto before = store->current();
  for (int reading = 2; reading < 5; ++reading) {
    askAfterTheTime();
    EXPECT_EQ(reads, reading);
    EXPECT_EQ(store->current(), before);
  }
}

TEST_F(TreeStoreLifetime, FailedReadingKeepsTheTreeAndIsLoggedOnceUntilOneSucceeds) {
  setSource([] { return treeOf("before"); });
  EXPECT_EQ(description(), "before");
  setSource([]() -> NodeTree { throw std::runtime_error("server.json:17: broken"); });
  for (int reading = 2; reading < 5; ++reading) {
    askAfterTheTime();
    EXPECT_EQ(reads, reading);
    EXPECT_EQ(description(), "before");
  }
  const std::vector<testing::LoggedMessage> log = testing::takeLog();
  ASSERT_EQ(log.size(), 2U) << "once to the log, once to the trace";
  EXPECT_FALSE(log[0].isTrace);
  EXPECT_TRUE(log[1].isTrace);
  for (const testing::LoggedMessage& message : log) {
    EXPECT_EQ(message.level, 3000);
    EXPECT_EQ(message.file, "agent/framework/TreeStore.cpp");
    EXPECT_THAT(message.message, HasSubstr("server.json:17: broken"));
  }

  setSource([] { return treeOf("repaired"); });
  askAfterTheTime();
  EXPECT_EQ(description(), "repaired");
  EXPECT_TRUE(testing::takeLog().empty());
  setSource([]() -> NodeTree { throw std::runtime_error("broken again"); });
  askAfterTheTime();
  EXPECT_EQ(description(), "repaired");
  EXPECT_EQ(testing::takeLog().size(), 2U);
}

TEST_F(TreeStoreLifetime, FailedReadingIsTriedAgainAfterTheSameTime) {
  setSource([] { return treeOf("before"); });
  EXPECT_EQ(description(), "before");
  setSource([]() -> NodeTree { throw std::runtime_error("broken"); });
  askAfterTheTime();
  EXPECT_EQ(reads, 2);
  pass(59s);
  EXPECT_EQ(description(), "before");
  store->waitForRereading();
  EXPECT_EQ(reads, 2);
  pass(1s);
  EXPECT_EQ(description(), "before");
  store->waitForRereading();
  EXPECT_EQ(reads, 3);
}

TEST_F(TreeStoreLifetime, FirstFailureIsTriedAgainByARequestAfterTheTime) {
  setSource([]() -> NodeTree { throw std::runtime_error("no file yet"); });
  EXPECT_THAT(failure(), HasSubstr("no file yet"));
  pass(59s);
  EXPECT_THAT(failure(), HasSubstr("no file yet"));
  EXPECT_EQ(reads, 1);
  setSource([]() -> NodeTree { throw std::runtime_error("half a file"); });
  pass(1s);
  EXPECT_THAT(failure(), HasSubstr("half a file"));
  EXPECT_EQ(reads, 2);
  EXPECT_EQ(testing::takeLog().size(), 2U) << "the first failure alone, to the log and to the trace";
  setSource([] { return treeOf("machine"); });
  pass(59s);
  EXPECT_THAT(failure(), HasSubstr("half a file"));
  pass(1s);
  EXPECT_EQ(description(), "machine") << "by that very request";
  EXPECT_EQ(reads, 3);
}

TEST_F(TreeStoreLifetime, PublishedTreeIsNotReplacedByAnEarlierReading) {
  setSource([] { return treeOf("before"); });
  EXPECT_EQ(description(), "before");
  std::promise<void> release;
  setSource([gate = release.get_future().share()] {
    gate.wait();
    return treeOf("read");
  });
  pass(60s);
  EXPECT_EQ(description(), "before");
  store->publish(treeOf("published"));
  release.set_value();
  store->waitForRereading();
  EXPECT_EQ(description(), "published");
}

TEST_F(TreeStoreLifetime, ALookAnewDoesNotWaitForTheTime) {
  setSource([] { return treeOf("before"); });
  store->lookAnew();
  EXPECT_EQ(reads, 0) << "nobody has asked yet";
  EXPECT_EQ(description(), "before");
  setSource([] { return treeOf("after"); });
  store->lookAnew();
  store->waitForRereading();
  EXPECT_EQ(description(), "after");
  EXPECT_EQ(reads, 2);
}

TEST_F(TreeStoreLifetime, ALookAnewDuringAReadingIsFollowedByAnother) {
  setSource([] { return treeOf("first"); });
  EXPECT_EQ(description(), "first");
  std::promise<void> release;
  setSource([gate = release.get_future().share()] {
    gate.wait();
    return treeOf("begun before");
  });
  store->lookAnew();
  store->lookAnew();
  release.set_value();
  store->waitForRereading();
  setSource([] { return treeOf("begun after"); });
  EXPECT_EQ(description(), "begun before");
  store->waitForRereading();
  EXPECT_EQ(description(), "begun after");
}

TEST_F(TreeStoreLifetime, ALookAnewEndsAFailure) {
  setSource([]() -> NodeTree { throw std::runtime_error("half a file"); });
  EXPECT_THAT(failure(), HasSubstr("half a file"));
  setSource([] { return treeOf("machine"); });
  store->lookAnew();
  EXPECT_EQ(description(), "machine");
}

}  // namespace
}  // namespace agent
