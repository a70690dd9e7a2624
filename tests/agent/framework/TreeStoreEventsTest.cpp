// What becomes of a tree when its source changes.
#include "TestSource.h"

#include <agent/framework/TreeStore.h>

#include <Oru/Exceptions.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <atomic>
#include <chrono>
#include <condition_variable>
#include <cstdint>
#include <functional>
#include <future>
#include <memory>
#include <mutex>
#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

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

/// What a test tells the thread that waits for events, and what that thread did.
class Machine {
 public:
  void change() {
    const std::lock_guard lock(mutex_);
    ++changes_;
    told_.notify_all();
  }
  void fail(const std::string& reason) {
    const std::lock_guard lock(mutex_);
    failure_ = reason;
    told_.notify_all();
  }
  void stop() {
    const std::lock_guard lock(mutex_);
    isStopped_ = true;
    told_.notify_all();
  }

  bool waitForChange() {
    std::unique_lock lock(mutex_);
    ++waits_;
    told_.notify_all();
    told_.wait(lock, [this] { return changes_ > 0 || !failure_.empty() || isStopped_; });
    if (isStopped_) {
      return false;
    }
    if (!failure_.empty()) {
      throw std::runtime_error(failure_);
    }
    --changes_;
    return true;
  }

  /// Until the thread waits for the `count`th time: the looks before are over.
  void awaitWait(int count) {
    std::unique_lock lock(mutex_);
    told_.wait(lock, [&] { return waits_ >= count; });
  }
  void awaitEnd() {
    std::unique_lock lock(mutex_);
    told_.wait(lock, [this] { return isOver_; });
  }
  void end() {
    const std::lock_guard lock(mutex_);
    isOver_ = true;
    told_.notify_all();
  }

 private:
  std::mutex mutex_;
  std::condition_variable told_;
  int changes_ = 0;
  int waits_ = 0;
  std::string failure_;
  bool isStopped_ = false;
  bool isOver_ = false;
};

class MachineEvents : public Events {
 public:
  explicit MachineEvents(Machine& machine) : machine_(machine) {}
  ~MachineEvents() override { machine_.end(); }
  bool waitForChange() override { return machine_.waitForChange(); }
  void stop() noexcept override { machine_.stop(); }

 private:
  Machine& machine_;
};

/// A source that hangs until it is released, and then gives `found`.
class HangingLook {
 public:
  explicit HangingLook(const char* found) : found_(found) {}

  NodeTree operator()() {
    begun_.set_value();
    gate_.wait();
    return treeOf(found_);
  }
  void awaitBegin() { begun_.get_future().wait(); }
  void release() { release_.set_value(); }

 private:
  const char* found_;
  std::promise<void> begun_;
  std::promise<void> release_;
  std::shared_future<void> gate_ = release_.get_future().share();
};

class TreeStoreEvents : public ::testing::Test {
 protected:
  void SetUp() override {
    testing::takeLog();
    testing::setEvents([this] {
      ++followed;
      return std::make_unique<MachineEvents>(machine);
    });
    setSource([] { return treeOf("before"); });
  }
  void TearDown() override {
    store.reset();
    testing::setSource(nullptr);
    testing::setEvents(nullptr);
    testing::setInventory(false);
  }

  void setSource(const std::function<NodeTree()>& source) {
    testing::setSource([this, source] {
      ++reads;
      most = std::max(most.load(), ++atOnce);
      NodeTree tree = source();
      --atOnce;
      return tree;
    });
  }

  std::string description() { return std::string(store->current()->description(0)); }

  std::atomic<std::int64_t> seconds = 1000;
  std::atomic<int> reads = 0;
  std::atomic<int> atOnce = 0;
  std::atomic<int> most = 0;
  std::atomic<int> followed = 0;
  Machine machine;
  std::unique_ptr<TreeStore> store = std::make_unique<TreeStore>(
      TreeStore::usualLifetime, [this] { return Time(std::chrono::seconds(seconds.load())); });
};

TEST_F(TreeStoreEvents, ChangeShowsWithoutTimePassing) {
  const auto before = store->current();
  EXPECT_EQ(before->description(0), "before");
  setSource([] { return treeOf("after"); });
  machine.awaitWait(1);
  EXPECT_EQ(description(), "before");
  machine.change();
  machine.awaitWait(2);
  EXPECT_EQ(description(), "after");
  EXPECT_EQ(before->description(0), "before") << "a request under way keeps its tree";
  EXPECT_EQ(reads, 2);
  EXPECT_TRUE(testing::takeLog().empty());
}

TEST_F(TreeStoreEvents, NoRequestWaitsForTheLook) {
  EXPECT_EQ(description(), "before");
  HangingLook look("after");
  setSource(std::ref(look));
  machine.change();
  look.awaitBegin();
  EXPECT_EQ(description(), "before") << "while the look hangs";
  seconds += 600;
  EXPECT_EQ(description(), "before") << "also when the tree is old";
  look.release();
  machine.awaitWait(2);
  EXPECT_EQ(description(), "after");
  EXPECT_EQ(reads, 2);
}

TEST_F(TreeStoreEvents, OneLookAtATime) {
  EXPECT_EQ(description(), "before");
  HangingLook look("half");
  setSource(std::ref(look));
  seconds += 60;
  EXPECT_EQ(description(), "before");
  look.awaitBegin();  // the reading that the request started
  machine.change();
  setSource([] { return treeOf("after"); });
  look.release();
  machine.awaitWait(2);
  EXPECT_EQ(description(), "after") << "the reading under way may have passed what changed";
  EXPECT_EQ(reads, 3);
  EXPECT_EQ(most, 1);
}

TEST_F(TreeStoreEvents, EveryChangeIsFollowedByALook) {
  EXPECT_EQ(description(), "before");
  for (int look = 1; look <= 5; ++look) {
    setSource([look] { return treeOf(std::to_string(look)); });
    machine.change();
    machine.awaitWait(look + 1);
    EXPECT_EQ(description(), std::to_string(look));
  }
  EXPECT_EQ(reads, 6);
  EXPECT_EQ(followed, 1);
}

TEST_F(TreeStoreEvents, LookStartsTheLifetimeAnew) {
  EXPECT_EQ(description(), "before");
  seconds += 59;
  machine.change();
  machine.awaitWait(2);
  seconds += 59;
  EXPECT_EQ(description(), "before");
  store->waitForRereading();
  EXPECT_EQ(reads, 2);
}

TEST_F(TreeStoreEvents, EqualTreeLeavesTheEarlierOneInPlace) {
  const auto before = store->current();
  machine.change();
  machine.awaitWait(2);
  EXPECT_EQ(reads, 2);
  EXPECT_EQ(store->current(), before);
}

TEST_F(TreeStoreEvents, AreNotFollowedBeforeThereIsATree) {
  EXPECT_EQ(followed, 0);
  setSource([]() -> NodeTree { throw std::runtime_error("broken"); });
  EXPECT_THROW(store->current(), Oru::InstrumentationException);
  EXPECT_EQ(followed, 0);
}

TEST_F(TreeStoreEvents, InventoryFileHasNone) {
  testing::setInventory(true);
  EXPECT_EQ(description(), "before");
  EXPECT_EQ(followed, 0);

  testing::setInventory(false);
  seconds += 60;
  EXPECT_EQ(description(), "before");
  store->waitForRereading();
  EXPECT_EQ(followed, 1) << "from the first reading of the live machine on";
}

TEST_F(TreeStoreEvents, DoNotReplaceAnInventoryFile) {
  EXPECT_EQ(description(), "before");
  testing::setInventory(true);
  setSource([] { return treeOf("file"); });
  seconds += 60;
  EXPECT_EQ(description(), "before");
  store->waitForRereading();
  EXPECT_EQ(description(), "file");
  machine.change();
  machine.awaitWait(2);
  EXPECT_EQ(description(), "file");
  EXPECT_EQ(reads, 2);
}

TEST_F(TreeStoreEvents, FailureIsLoggedOnceAndTheLifetimeHolds) {
  EXPECT_EQ(description(), "before");
  machine.fail("the socket: Operation not permitted");
  machine.awaitEnd();
  setSource([] { return treeOf("after"); });
  seconds += 60;
  EXPECT_EQ(description(), "before");
  store->waitForRereading();
  EXPECT_EQ(description(), "after");
  EXPECT_EQ(followed, 1);
  const std::vector<testing::LoggedMessage> log = testing::takeLog();
  ASSERT_EQ(log.size(), 2U) << "once to the log, once to the trace";
  EXPECT_THAT(log[0].message, HasSubstr("the socket: Operation not permitted"));
  EXPECT_THAT(log[0].message, HasSubstr("after a minute only"));
}

TEST_F(TreeStoreEvents, RequestsGoOnWhereThereIsNoDescriptorForThem) {
  testing::setEvents([this]() -> std::unique_ptr<Events> {
    ++followed;
    throw std::runtime_error("eventfd: Too many open files");
  });
  EXPECT_EQ(description(), "before");
  seconds += 60;
  EXPECT_EQ(description(), "before");
  store->waitForRereading();
  EXPECT_EQ(followed, 1);
  const std::vector<testing::LoggedMessage> log = testing::takeLog();
  ASSERT_EQ(log.size(), 2U);
  EXPECT_THAT(log[0].message, HasSubstr("Too many open files"));
}

TEST_F(TreeStoreEvents, StoreEndsAfterTheLookUnderWay) {
  EXPECT_EQ(description(), "before");
  HangingLook look("after");
  setSource(std::ref(look));
  machine.change();
  look.awaitBegin();
  std::future<void> ended = std::async(std::launch::async, [this] { store.reset(); });
  EXPECT_EQ(ended.wait_for(0s), std::future_status::timeout);
  look.release();
  ended.get();
  machine.awaitEnd();
}

}  // namespace
}  // namespace agent
