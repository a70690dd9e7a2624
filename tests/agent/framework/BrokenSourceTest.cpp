// A process whose source cannot be read. A program of its own: the store of a process reads its source once.
#include "TestSource.h"

#include <agent/framework/TreeStore.h>

#include <Oru/Exceptions.h>
#include <Oru/Instrumentation.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <stdexcept>
#include <string>

namespace {

using ::testing::HasSubstr;

bool isOnNode(Oru::Instrumentation& cursor) {
  return static_cast<bool>(cursor);
}

agent::NodeTree oneNode() {
  agent::NodeTreeBuilder builder;
  builder.add(agent::NodeTreeBuilder::noParent, Oru::NodeLexicon::FirmwareNode, "x", "x");
  return builder.build();
}

TEST(BrokenSource, ShowsInTheCursor) {
  agent::testing::setSource([]() -> agent::NodeTree { throw std::runtime_error("server.json:17: broken"); });
  Oru::Instrumentation cursor;
  cursor.selectNode(std::string("1"));
  EXPECT_FALSE(isOnNode(cursor));
  try {
    cursor.selectNode(Oru::NodeLexicon::FirmwareNode);
    FAIL() << "an unreadable source is not an empty machine";
  } catch (const Oru::InstrumentationException& error) {
    EXPECT_THAT(error.what(), HasSubstr("server.json:17: broken"));
  }
  EXPECT_FALSE(isOnNode(cursor));
  EXPECT_THROW(cursor.setFilter(Oru::NodeLexicon::ParentPath, "1"), Oru::InstrumentationException);

  agent::testing::setSource(nullptr);
  agent::TreeStore::instance().publish(oneNode());
  cursor.selectNode(Oru::NodeLexicon::FirmwareNode);
  EXPECT_TRUE(isOnNode(cursor));
}

}  // namespace
