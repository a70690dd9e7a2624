#include "TestSource.h"

#include <agent/framework/TreeStore.h>

#include <Oru/Exceptions.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <atomic>
#include <chrono>
#include <stdexcept>
#include <thread>
#include <vector>

namespace agent {
namespace {

using ::testing::HasSubstr;

NodeTree treeOf(std::string_view description) {
  NodeTreeBuilder builder;
  builder.add(NodeTreeBuilder::noParent, Oru::NodeLexicon::FirmwareNode, "x", description);
  return builder.build();
}

class TreeStoreTest : public ::testing::Test {
 protected:
  void SetUp() override { testing::takeLog(); }
  void TearDown() override { testing::setSource(nullptr); }

  std::string failure() {
    try {
      store.current();
    } catch (const Oru::InstrumentationException& error) {
      return error.what();
    }
    return {};
  }

  TreeStore store;
  std::atomic<int> reads = 0;
};

TEST_F(TreeStoreTest, ReadsAtTheFirstRequestAndOnlyThen) {
  testing::setSource([this] {
    ++reads;
    return treeOf("machine");
  });
  EXPECT_EQ(reads, 0);
  const auto tree = store.current();
  EXPECT_EQ(tree->description(0), "machine");
  EXPECT_EQ(store.current(), tree);
  EXPECT_EQ(reads, 1);
  EXPECT_TRUE(testing::takeLog().empty());
}

TEST_F(TreeStoreTest, ReadsOnceForConcurrentFirstRequests) {
  testing::setSource([this] {
    ++reads;
    std::this_thread::sleep_for(std::chrono::milliseconds(20));
    return treeOf("machine");
  });
  std::vector<std::shared_ptr<const NodeTree>> seen(8);
  std::vector<std::thread> threads;
  for (auto& tree : seen) {
    threads.emplace_back([this, &tree] { tree = store.current(); });
  }
  for (std::thread& thread : threads) {
    thread.join();
  }
  EXPECT_EQ(reads, 1);
  for (const auto& tree : seen) {
    EXPECT_EQ(tree, seen.front());
  }
}

TEST_F(TreeStoreTest, PublishedTreeReplacesTheReadOne) {
  store.publish(treeOf("published"));
  testing::setSource([this] {
    ++reads;
    return treeOf("read");
  });
  const auto first = store.current();
  EXPECT_EQ(first->description(0), "published");
  EXPECT_EQ(reads, 0);
  store.publish(treeOf("later"));
  EXPECT_EQ(store.current()->description(0), "later");
  EXPECT_EQ(first->description(0), "published");
}

TEST_F(TreeStoreTest, FailureIsLoggedOnceAndRemembered) {
  testing::setSource([this]() -> NodeTree {
    ++reads;
    throw std::runtime_error("server.json:17: nodes[2].type: expected a node type");
  });
  EXPECT_THAT(failure(), HasSubstr("server.json:17"));
  EXPECT_THAT(failure(), HasSubstr("server.json:17"));
  EXPECT_EQ(reads, 1);

  const std::vector<testing::LoggedMessage> log = testing::takeLog();
  ASSERT_EQ(log.size(), 2U) << "once to the log, once to the trace";
  EXPECT_FALSE(log[0].isTrace);
  EXPECT_TRUE(log[1].isTrace);
  for (const testing::LoggedMessage& message : log) {
    EXPECT_EQ(message.category, "Oru.Framework");
    EXPECT_EQ(message.level, 3000);
    EXPECT_EQ(message.file, "agent/framework/TreeStore.cpp");
    EXPECT_THAT(message.message, HasSubstr("server.json:17"));
  }
}

TEST_F(TreeStoreTest, PublishEndsAFailure) {
  testing::setSource([]() -> NodeTree { throw std::runtime_error("broken"); });
  EXPECT_NE(failure(), "");
  store.publish(treeOf("repaired"));
  EXPECT_EQ(failure(), "");
  EXPECT_EQ(store.current()->description(0), "repaired");
}

}  // namespace
}  // namespace agent
