// Many cursors on many threads while the tree is replaced.
#include <agent/framework/TreeStore.h>

#include <Oru/Exceptions.h>
#include <Oru/Instrumentation.h>

#include <gtest/gtest.h>

#include <atomic>
#include <string>
#include <thread>
#include <vector>

namespace {

using namespace Oru::NodeLexicon;

/// A tree whose nodes all say the same generation.
agent::NodeTree generation(unsigned int number) {
  agent::NodeTreeBuilder builder;
  const auto computer =
      builder.add(agent::NodeTreeBuilder::noParent, ComputerSystemNode, agent::computerPosition, "");
  for (unsigned int i = 0; i < 20 + number % 5; ++i) {
    const auto node =
        builder.add(computer, FirmwareNode, "firmware" + std::to_string(i), std::to_string(number));
    builder.setValue(node, MajorVersionProperty, number);
  }
  return builder.build();
}

/// Walks once; false where one walk saw two generations, or less than all nodes.
bool walkIsOfOneGeneration() {
  Oru::Instrumentation cursor;
  cursor.selectNode(FirmwareNode);
  cursor.setFilter(ParentPath, "1");
  const std::string description = cursor.getNodeDescription();
  unsigned int count = 0;
  unsigned int number = 0;
  for (; cursor; ++cursor) {
    ++count;
    if (!cursor.getProperty(MajorVersionProperty, number) || cursor.getNodeDescription() != description ||
        std::to_string(number) != description || cursor.getPathToComputer() != "1") {
      return false;
    }
  }
  return count == 20 + number % 5;
}

TEST(CursorThreads, EachWalkSeesOneWholeTreeWhileTreesAreReplaced) {
  agent::TreeStore& store = agent::TreeStore::instance();
  store.publish(generation(0));
  std::atomic<bool> isDone = false;
  std::atomic<unsigned int> walks = 0;
  std::atomic<unsigned int> failures = 0;

  std::vector<std::thread> readers;
  for (int i = 0; i < 6; ++i) {
    readers.emplace_back([&] {
      do {
        failures += walkIsOfOneGeneration() ? 0U : 1U;
        ++walks;
      } while (!isDone);
    });
  }
  for (unsigned int number = 1; number < 400; ++number) {
    store.publish(generation(number));
  }
  isDone = true;
  for (std::thread& reader : readers) {
    reader.join();
  }
  EXPECT_EQ(failures, 0U);
  EXPECT_GE(walks, 6U);
}

}  // namespace
