// The cursor's contract over a small machine:
//
//   computer 1
//     BIOS b1
//     network device d1
//       firmware f1
//       port a1, port a2
//     network device d2
//       port a3
//     blade computer c2
//       BIOS b2
//       network device d3
//         firmware f3
//     driver e1
//   stray firmware 51        (a second root)
#include <agent/framework/TreeStore.h>

#include <Oru/Exceptions.h>
#include <Oru/Instrumentation.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace {

using namespace Oru::NodeLexicon;
using agent::NodeNumber;
using agent::NodeTree;
using agent::NodeTreeBuilder;
using Oru::Instrumentation;
using Oru::InstrumentationException;
using ::testing::ElementsAre;
using ::testing::HasSubstr;

class TreeOfNumbers {
 public:
  NodeTreeBuilder::Handle add(NodeTreeBuilder::Handle parent, NodeType type, NodeNumber number,
                              const std::string& description) {
    const auto node = builder.add(parent, type, "", description);
    builder.setNumber(node, number);
    return node;
  }
  NodeTreeBuilder builder;
};

NodeTree machine() {
  TreeOfNumbers tree;
  const auto computer = tree.add(NodeTreeBuilder::noParent, ComputerSystemNode, 1, "Computer System");
  const auto bios = tree.add(computer, FirmwareNode, 0xb1, "BIOS");
  tree.builder.setText(bios, VersionStringProperty, "2.14.1");
  tree.builder.setValue(bios, MajorVersionProperty, 70000);
  const auto device = tree.add(computer, NetworkDeviceNode, 0xd1, "Network Device");
  tree.add(device, FirmwareNode, 0xf1, "Network Firmware");
  tree.add(device, NetworkPortNode, 0xa1, "eth0");
  tree.add(device, NetworkPortNode, 0xa2, "eth1");
  tree.add(tree.add(computer, NetworkDeviceNode, 0xd2, "Network Device"), NetworkPortNode, 0xa3, "eth2");
  const auto blade = tree.add(computer, ComputerSystemNode, 0xc2, "Blade");
  tree.add(blade, FirmwareNode, 0xb2, "BIOS");
  tree.add(tree.add(blade, NetworkDeviceNode, 0xd3, "Network Device"), FirmwareNode, 0xf3,
           "Network Firmware");
  tree.add(computer, DriverNode, 0xe1, "driver");
  tree.add(NodeTreeBuilder::noParent, FirmwareNode, 0x51, "stray");
  return tree.builder.build();
}

bool isOnNode(Oru::Instrumentation& cursor) {
  return static_cast<bool>(cursor);
}

std::vector<std::string> restOf(Instrumentation& cursor) {
  std::vector<std::string> paths;
  for (; cursor; ++cursor) {
    paths.push_back(cursor.getPathToNode());
  }
  return paths;
}

std::string messageOfFilter(Instrumentation& cursor, PathType type, const std::string& path) {
  try {
    cursor.setFilter(type, path);
  } catch (const InstrumentationException& error) {
    return error.what();
  }
  return {};
}

void expectOnNoNode(Instrumentation& cursor) {
  EXPECT_FALSE(isOnNode(cursor));
  EXPECT_EQ(cursor.getPathToNode(), "");
  EXPECT_EQ(cursor.getPathToParentNode(), "");
  EXPECT_EQ(cursor.getPathToComputer(), "");
  EXPECT_EQ(cursor.getNodeDescription(), "");
  EXPECT_EQ(cursor.getSensorType(), -1);
  std::string text = "as it was";
  EXPECT_FALSE(cursor.getProperty(VersionStringProperty, text));
  EXPECT_EQ(text, "as it was");
  unsigned int number = 17;
  EXPECT_FALSE(cursor.getProperty(MajorVersionProperty, number));
  EXPECT_EQ(number, 17U);
  EXPECT_FALSE(cursor.setProperty(ElementSoftwareStatusProperty, {2}));
  ++cursor;
  EXPECT_FALSE(isOnNode(cursor));
}

class InstrumentationTest : public ::testing::Test {
 protected:
  void SetUp() override { agent::TreeStore::instance().publish(machine()); }

  Instrumentation cursor;
};

TEST_F(InstrumentationTest, FreshCursorStandsOnNoNode) {
  expectOnNoNode(cursor);
}

TEST_F(InstrumentationTest, FilterOnAFreshCursorThrows) {
  EXPECT_NE(messageOfFilter(cursor, ExactPath, "b1"), "");
  expectOnNoNode(cursor);
}

TEST_F(InstrumentationTest, WalkByTypeReachesAllNodesOfTheTypeInPreOrder) {
  cursor.selectNode(FirmwareNode);
  EXPECT_THAT(restOf(cursor), ElementsAre("b1", "f1", "b2", "f3", "51"));
  expectOnNoNode(cursor);
  cursor.selectNode(ComputerSystemNode);
  EXPECT_THAT(restOf(cursor), ElementsAre("1", "c2"));
}

TEST_F(InstrumentationTest, TypeWithoutNodesThrowsNothingAndLeavesNoNode) {
  cursor.selectNode(FirmwareNode);
  cursor.selectNode(BiosNode);
  expectOnNoNode(cursor);
  cursor.selectNode(static_cast<NodeType>(4711));
  expectOnNoNode(cursor);
  EXPECT_NE(messageOfFilter(cursor, ParentPath, "1"), "") << "nothing passes a filter over nothing";
  expectOnNoNode(cursor);
}

TEST_F(InstrumentationTest, SelectionStartsOver) {
  cursor.selectNode(FirmwareNode);
  cursor.setFilter(ParentPath, "c2");
  cursor.selectNode(FirmwareNode);
  EXPECT_THAT(restOf(cursor), ElementsAre("b1", "f1", "b2", "f3", "51")) << "the filter is gone";
}

TEST_F(InstrumentationTest, SelectByPathIsAWalkOfOneNode) {
  cursor.selectNode(std::string("d1"));
  ASSERT_TRUE(isOnNode(cursor));
  EXPECT_EQ(cursor.getPathToNode(), "d1");
  EXPECT_EQ(cursor.getSensorType(), NetworkDeviceNode);
  EXPECT_EQ(cursor.getNodeDescription(), "Network Device");
  ++cursor;
  expectOnNoNode(cursor);
}

TEST_F(InstrumentationTest, PathThatNamesNothingLeavesNoNode) {
  // B1, 0b1 and the like are no paths: convertStringToPath makes a path of such a text.
  for (const char* path : {"", "0", "ffffffffffffffff", "2", "xyz", "B1", "0b1", " b1", "b1 ", "0xb1", "-1",
                           "100000000000000b1"}) {
    cursor.selectNode(std::string("b1"));
    cursor.selectNode(std::string(path));
    EXPECT_FALSE(isOnNode(cursor)) << path;
    expectOnNoNode(cursor);
  }
}

TEST_F(InstrumentationTest, PathsOfParentAndComputer) {
  cursor.selectNode(std::string("f3"));
  EXPECT_EQ(cursor.getPathToParentNode(), "d3");
  EXPECT_EQ(cursor.getPathToComputer(), "c2") << "the nearest";
  cursor.selectNode(std::string("f1"));
  EXPECT_EQ(cursor.getPathToComputer(), "1");
  cursor.selectNode(std::string("c2"));
  EXPECT_EQ(cursor.getPathToComputer(), "c2") << "a computer is its own";
  EXPECT_EQ(cursor.getPathToParentNode(), "1");
}

TEST_F(InstrumentationTest, RootHasNoParentAndANodeBelowNoComputerHasNone) {
  cursor.selectNode(std::string("1"));
  EXPECT_EQ(cursor.getPathToParentNode(), "");
  cursor.selectNode(std::string("51"));
  EXPECT_EQ(cursor.getPathToParentNode(), "");
  EXPECT_EQ(cursor.getPathToComputer(), "");
  ASSERT_TRUE(isOnNode(cursor));
}

TEST_F(InstrumentationTest, ClimbEndsOnNoNodeAboveTheRoot) {
  cursor.selectNode(std::string("f1"));
  std::vector<std::string> climbed;
  while (cursor) {
    climbed.push_back(cursor.getPathToNode());
    cursor.selectNode(cursor.getPathToParentNode());
  }
  EXPECT_THAT(climbed, ElementsAre("f1", "d1", "1"));
}

TEST_F(InstrumentationTest, ExactPathNarrowsToThatNode) {
  cursor.selectNode(FirmwareNode);
  cursor.setFilter(ExactPath, "b2");
  EXPECT_THAT(restOf(cursor), ElementsAre("b2"));
}

TEST_F(InstrumentationTest, ExactPathOfANodeOutsideTheWalkPassesNothing) {
  cursor.selectNode(FirmwareNode);
  EXPECT_THAT(messageOfFilter(cursor, ExactPath, "a1"), HasSubstr("\"a1\""));
  expectOnNoNode(cursor);
}

TEST_F(InstrumentationTest, ParentPathNarrowsToAllThatIsBelowAtAnyDepth) {
  cursor.selectNode(FirmwareNode);
  cursor.setFilter(ParentPath, "1");
  EXPECT_THAT(restOf(cursor), ElementsAre("b1", "f1", "b2", "f3"));
  cursor.selectNode(NetworkPortNode);
  cursor.setFilter(ParentPath, "d1");
  EXPECT_THAT(restOf(cursor), ElementsAre("a1", "a2"));
  cursor.selectNode(ComputerSystemNode);
  cursor.setFilter(ParentPath, "1");
  EXPECT_THAT(restOf(cursor), ElementsAre("c2")) << "a node is not below itself";
}

TEST_F(InstrumentationTest, ParentPathOfALeafOrOfNothingPassesNothing) {
  for (const char* path : {"b1", "77", "", "xyz", "0", "ffffffffffffffff"}) {
    cursor.selectNode(FirmwareNode);
    EXPECT_THAT(messageOfFilter(cursor, ParentPath, path), HasSubstr("\"" + std::string(path) + "\""));
    expectOnNoNode(cursor);
  }
}

TEST_F(InstrumentationTest, ComputerPathNarrowsToAllThatIsBelowThatComputer) {
  cursor.selectNode(FirmwareNode);
  cursor.setFilter(ComputerPath, "1");
  EXPECT_THAT(restOf(cursor), ElementsAre("b1", "f1", "b2", "f3"));
  cursor.selectNode(FirmwareNode);
  cursor.setFilter(ComputerPath, "c2");
  EXPECT_THAT(restOf(cursor), ElementsAre("b2", "f3"));
}

TEST_F(InstrumentationTest, ComputerPathOfAnotherNodePassesNothing) {
  cursor.selectNode(NetworkPortNode);
  EXPECT_THAT(messageOfFilter(cursor, ComputerPath, "d1"), HasSubstr("computer"));
  expectOnNoNode(cursor);
}

TEST_F(InstrumentationTest, UnknownPathTypePassesNothing) {
  cursor.selectNode(FirmwareNode);
  EXPECT_THAT(messageOfFilter(cursor, static_cast<PathType>(3), "1"), HasSubstr("3"));
  expectOnNoNode(cursor);
}

TEST_F(InstrumentationTest, LaterFilterReplacesTheOneBefore) {
  cursor.selectNode(FirmwareNode);
  cursor.setFilter(ExactPath, "f3");
  EXPECT_THAT(restOf(cursor), ElementsAre("f3"));
  cursor.setFilter(ParentPath, "d1");
  EXPECT_THAT(restOf(cursor), ElementsAre("f1")) << "f1 did not pass the filter before";
  cursor.setFilter(ComputerPath, "1");
  EXPECT_THAT(restOf(cursor), ElementsAre("b1", "f1", "b2", "f3"));
  cursor.setFilter(ParentPath, "c2");
  EXPECT_THAT(restOf(cursor), ElementsAre("b2", "f3"));
  EXPECT_NE(messageOfFilter(cursor, ParentPath, "a1"), "") << "ports are no firmware, whatever the filter";
  expectOnNoNode(cursor);
}

TEST_F(InstrumentationTest, FilterThatNothingPassesLeavesTheWalkForTheNext) {
  cursor.selectNode(FirmwareNode);
  for (const char* path : {"d2", "xyz"}) {
    EXPECT_NE(messageOfFilter(cursor, ParentPath, path), "");
    expectOnNoNode(cursor);
    cursor.setFilter(ParentPath, "d1");
    EXPECT_THAT(restOf(cursor), ElementsAre("f1"));
  }
}

TEST_F(InstrumentationTest, FilterStartsAtTheFirstNodeThatPassesWhereverTheCursorStood) {
  cursor.selectNode(FirmwareNode);
  ++cursor;
  ++cursor;
  cursor.setFilter(ParentPath, "1");
  EXPECT_EQ(cursor.getPathToNode(), "b1");
  restOf(cursor);
  cursor.setFilter(ParentPath, "d1");
  EXPECT_EQ(cursor.getPathToNode(), "f1") << "also from past the end of the walk";
  restOf(cursor);
  expectOnNoNode(cursor);
  cursor.setFilter(ParentPath, "d1");
  EXPECT_THAT(restOf(cursor), ElementsAre("f1")) << "under the same filter, too";
}

TEST_F(InstrumentationTest, FilterNarrowsTheWalkOfOneNode) {
  cursor.selectNode(std::string("f1"));
  cursor.setFilter(ParentPath, "d1");
  EXPECT_EQ(cursor.getPathToNode(), "f1");
  cursor.setFilter(ExactPath, "f1");
  EXPECT_TRUE(isOnNode(cursor));
  EXPECT_NE(messageOfFilter(cursor, ParentPath, "d2"), "");
  expectOnNoNode(cursor);
  cursor.setFilter(ComputerPath, "1");
  EXPECT_THAT(restOf(cursor), ElementsAre("f1"));
}

TEST_F(InstrumentationTest, PropertyOfTheOtherKindIsNotThere) {
  cursor.selectNode(std::string("b1"));
  std::string text;
  unsigned int number = 0;
  EXPECT_TRUE(cursor.getProperty(VersionStringProperty, text));
  EXPECT_EQ(text, "2.14.1");
  EXPECT_TRUE(cursor.getProperty(MajorVersionProperty, number));
  EXPECT_EQ(number, 70000U);
  EXPECT_FALSE(cursor.getProperty(MajorVersionProperty, text));
  EXPECT_FALSE(cursor.getProperty(VersionStringProperty, number));
  EXPECT_FALSE(cursor.getProperty(NameProperty, text));
  EXPECT_FALSE(cursor.getProperty(static_cast<Properties>(-1), text));
}

TEST_F(InstrumentationTest, NoPropertyCanBeWritten) {
  cursor.selectNode(std::string("b1"));
  EXPECT_FALSE(cursor.setProperty(ElementSoftwareStatusProperty, {2, 3}));
  EXPECT_FALSE(cursor.setProperty(VersionStringProperty, {}));
}

TEST_F(InstrumentationTest, PathsAndTheirTextsConvertBothWays) {
  for (const char* path : {"b1", "1", "abcdef012345678"}) {
    EXPECT_EQ(cursor.convertPathToString(path), path);
    EXPECT_EQ(cursor.convertStringToPath(path), path);
  }
  EXPECT_EQ(cursor.convertStringToPath("B1"), "b1");
  EXPECT_EQ(cursor.convertStringToPath("000000000000000000b1"), "b1");
  EXPECT_EQ(cursor.convertStringToPath("0000"), "0");
  EXPECT_EQ(cursor.convertStringToPath("FFFFFFFFFFFFFFFF"), "ffffffffffffffff");
  for (const char* text : {"", "xyz", "1g", " b1", "0xb1", "100000000000000b1"}) {
    EXPECT_EQ(cursor.convertStringToPath(text), text);
    EXPECT_EQ(cursor.convertPathToString(text), text);
  }
  cursor.selectNode(cursor.convertStringToPath("00B1"));
  EXPECT_EQ(cursor.getPathToNode(), "b1");
}

TEST_F(InstrumentationTest, CursorKeepsItsTreeWhenAnotherIsPublished) {
  cursor.selectNode(FirmwareNode);
  Instrumentation unused;
  TreeOfNumbers other;
  other.add(NodeTreeBuilder::noParent, FirmwareNode, 0x99, "another machine");
  agent::TreeStore::instance().publish(other.builder.build());

  EXPECT_EQ(cursor.getNodeDescription(), "BIOS");
  cursor.selectNode(std::string("d1"));
  EXPECT_TRUE(isOnNode(cursor)) << "a request under way keeps its tree";
  Instrumentation later;
  later.selectNode(FirmwareNode);
  EXPECT_THAT(restOf(later), ElementsAre("99"));
  unused.selectNode(FirmwareNode);
  EXPECT_THAT(restOf(unused), ElementsAre("99")) << "a cursor takes its tree when it first selects";
}

TEST_F(InstrumentationTest, EmptyTreeHasNoNodes) {
  agent::TreeStore::instance().publish(NodeTree());
  cursor.selectNode(FirmwareNode);
  expectOnNoNode(cursor);
  cursor.selectNode(std::string("1"));
  expectOnNoNode(cursor);
}

}  // namespace
