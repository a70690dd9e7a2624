// The tree: its shape, its indices and its numbers.
#include "RandomTree.h"

#include <agent/framework/NodeTree.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <map>
#include <set>
#include <string>

namespace agent {
namespace {

using namespace Oru::NodeLexicon;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;
constexpr auto noParent = NodeTreeBuilder::noParent;

TEST(NodeTree, IsEmptyAtFirst) {
  const NodeTree tree;
  EXPECT_EQ(tree.size(), 0U);
  EXPECT_EQ(tree.find(1), NodeTree::none);
  EXPECT_THAT(tree.ofType(FirmwareNode), IsEmpty());
  EXPECT_EQ(tree, NodeTreeBuilder().build());
}

TEST(NodeTree, StandsInPreOrderWhateverTheOrderOfAdding) {
  NodeTreeBuilder builder;
  const auto computer = builder.add(noParent, ComputerSystemNode, "computer", "computer");
  const auto other = builder.add(noParent, ComputerSystemNode, "blade", "blade");
  const auto device = builder.add(computer, NetworkDeviceNode, "a", "device");
  builder.add(computer, FirmwareNode, "bios", "BIOS");
  builder.add(other, FirmwareNode, "blade/bios", "BIOS of the blade");
  builder.add(device, NetworkPortNode, "a/1", "port");
  const NodeTree tree = builder.build();

  std::vector<std::string> descriptions;
  for (NodeTree::Index node = 0; node < tree.size(); ++node) {
    descriptions.emplace_back(tree.description(node));
  }
  EXPECT_THAT(descriptions, ElementsAre("computer", "device", "port", "BIOS", "blade", "BIOS of the blade"));
  EXPECT_EQ(tree.subtreeEnd(0), 4U);
  EXPECT_EQ(tree.subtreeEnd(1), 3U);
  EXPECT_EQ(tree.subtreeEnd(3), 4U);
  EXPECT_EQ(tree.subtreeEnd(4), 6U);
  EXPECT_EQ(tree.parent(2), 1U);
  EXPECT_EQ(tree.parent(0), NodeTree::none);
  EXPECT_EQ(tree.parent(4), NodeTree::none);
  EXPECT_EQ(tree.computer(0), 0U) << "a computer is its own";
  EXPECT_EQ(tree.computer(2), 0U);
  EXPECT_EQ(tree.computer(5), 4U);
  EXPECT_THAT(tree.ofType(ComputerSystemNode), ElementsAre(0U, 4U));
  EXPECT_THAT(tree.ofType(FirmwareNode), ElementsAre(3U, 5U));
  EXPECT_THAT(tree.ofType(DriverNode), IsEmpty());
}

TEST(NodeTree, HasNoComputerWhereNoneStandsAbove) {
  NodeTreeBuilder builder;
  const auto root = builder.add(noParent, NetworkDeviceNode, "a", "");
  builder.add(root, FirmwareNode, "b", "");
  const NodeTree tree = builder.build();
  EXPECT_EQ(tree.computer(0), NodeTree::none);
  EXPECT_EQ(tree.computer(1), NodeTree::none);
}

TEST(NodeTree, KeepsTextsAndNumbersApart) {
  NodeTreeBuilder builder;
  const auto node = builder.add(noParent, FirmwareNode, "bios", "BIOS");
  builder.setText(node, VersionStringProperty, " 2.14 ");
  builder.setValue(node, MajorVersionProperty, 0);
  builder.setText(node, ManufacturerProperty, " \t");
  const NodeTree tree = builder.build();
  EXPECT_EQ(tree.text(0, VersionStringProperty), "2.14");
  EXPECT_EQ(tree.value(0, VersionStringProperty), std::nullopt);
  EXPECT_EQ(tree.value(0, MajorVersionProperty), 0U);
  EXPECT_EQ(tree.text(0, MajorVersionProperty), std::nullopt);
  EXPECT_EQ(tree.text(0, ManufacturerProperty), std::nullopt) << "an empty text is no value";
  EXPECT_THAT(tree.properties(0), ElementsAre(PropertyView{MajorVersionProperty, false, 0, {}},
                                              PropertyView{VersionStringProperty, true, 0, "2.14"}));
}

TEST(NodeTree, TakesTheLastSettingOfAProperty) {
  NodeTreeBuilder builder;
  const auto node = builder.add(noParent, FirmwareNode, "bios", "BIOS");
  builder.setText(node, NameProperty, "first");
  builder.setText(node, VersionStringProperty, "1");
  builder.setValue(node, NameProperty, 2);
  builder.setText(node, NameProperty, "third");
  const NodeTree tree = builder.build();
  EXPECT_EQ(tree.text(0, NameProperty), "third");
  EXPECT_EQ(tree.properties(0).size(), 2U);
}

TEST(NodeTreeBuilder, RefusesWhatMakesNoTree) {
  NodeTreeBuilder builder;
  EXPECT_THROW(builder.add(0, FirmwareNode, "", ""), std::invalid_argument) << "no node to stand below yet";
  EXPECT_THROW(builder.add(noParent, -1, "", ""), std::invalid_argument);
  const auto node = builder.add(noParent, FirmwareNode, "", "");
  EXPECT_THROW(builder.setText(node, -1, "x"), std::invalid_argument);
  EXPECT_THROW(builder.setValue(node + 1, 1, 1), std::invalid_argument);
  EXPECT_EQ(builder.build().size(), 1U) << "what was refused left nothing behind";
}

TEST(NodeTreeBuilder, IsEmptyAfterBuilding) {
  NodeTreeBuilder builder;
  builder.setText(builder.add(noParent, FirmwareNode, "bios", "BIOS"), NameProperty, "x");
  builder.addReport({"dmi", "sys", SourceReport::Reason::Absent, ""});
  EXPECT_EQ(builder.build().size(), 1U);
  EXPECT_EQ(builder.build(), NodeTree());
  builder.setNumber(builder.add(noParent, FirmwareNode, "", ""), noNumber);
  EXPECT_THROW(builder.build(), DuplicateNumber);
  EXPECT_EQ(builder.build(), NodeTree());
}

TEST(NodeTreeBuilder, CarriesReportsWithCleanTexts) {
  NodeTreeBuilder builder;
  builder.addReport({"dmi", "sys/\xFF", SourceReport::Reason::NoPermission, "no\n"});
  EXPECT_THAT(builder.build().reports(),
              ElementsAre(SourceReport{"dmi", "sys/\xEF\xBF\xBD", SourceReport::Reason::NoPermission, "no"}));
}

struct Machine {
  std::string host = "atlas";
  std::string version = "1.0";
  std::string interface = "eth0";
  bool isReversed = false;
  bool hasExtraDevice = false;
};

/// The numbers of a machine's nodes by position and type.
std::map<std::pair<std::string, int>, NodeNumber> numbersOf(const Machine& machine) {
  NodeTreeBuilder builder;
  const auto computer = builder.add(noParent, ComputerSystemNode, computerPosition, machine.host);
  builder.setText(computer, NameProperty, machine.host);
  std::vector<std::string> buses{"0000:3b:00.0", "0000:af:00.0"};
  if (machine.hasExtraDevice) {
    buses.insert(buses.begin(), "0000:01:00.0");
  }
  if (machine.isReversed) {
    std::reverse(buses.begin(), buses.end());
  }
  for (const std::string& bus : buses) {
    const auto device = builder.add(computer, NetworkDeviceNode, bus, "Network Device");
    const auto firmware = builder.add(device, FirmwareNode, bus, "Network Firmware " + machine.version);
    builder.setText(firmware, VersionStringProperty, machine.version);
    builder.add(device, NetworkPortNode, bus + "/1", machine.interface);
  }
  const NodeTree tree = builder.build();
  std::map<std::pair<std::string, int>, NodeNumber> numbers;
  for (NodeTree::Index node = 0; node < tree.size(); ++node) {
    numbers[{std::string(tree.position(node)), tree.type(node)}] = tree.number(node);
  }
  return numbers;
}

TEST(NodeNumbers, DependOnNothingButKindAndPosition) {
  const auto numbers = numbersOf({});
  EXPECT_EQ(numbers.size(), 7U);
  EXPECT_EQ(numbers.at({"computer", ComputerSystemNode}), 1U);
  EXPECT_EQ(numbersOf({"other-host", "1.0", "eth0", false, false}), numbers);
  EXPECT_EQ(numbersOf({"atlas", "2.0", "eth0", false, false}), numbers);
  EXPECT_EQ(numbersOf({"atlas", "1.0", "ens1f0", false, false}), numbers);
  EXPECT_EQ(numbersOf({"atlas", "1.0", "eth0", true, false}), numbers);
  auto more = numbersOf({"atlas", "1.0", "eth0", false, true});
  EXPECT_EQ(more.size(), 10U);
  for (const auto& [key, number] : numbers) {
    EXPECT_EQ(more.at(key), number) << key.first;
  }
}

NodeNumber alwaysSeven(int, std::string_view, std::uint32_t n) {
  return 6 + n;
}

TEST(NodeNumbers, GoToTheFirstByKindAndPositionWhereTheyCollide) {
  for (const bool isReversed : {false, true}) {
    NodeTreeBuilder builder;
    std::vector<std::pair<int, std::string>> nodes{{3, "b"}, {3, "a"}, {2, "z"}, {44, "a"}};
    if (isReversed) {
      std::reverse(nodes.begin(), nodes.end());
    }
    for (const auto& [type, position] : nodes) {
      builder.add(noParent, type, position, position);
    }
    const NodeTree tree = builder.build(alwaysSeven);
    const auto numberOf = [&tree](int type, std::string_view position) {
      for (const NodeTree::Index node : tree.ofType(type)) {
        if (tree.position(node) == position) {
          return tree.number(node);
        }
      }
      return noNumber;
    };
    EXPECT_EQ(numberOf(2, "z"), 7U);
    EXPECT_EQ(numberOf(3, "a"), 8U);
    EXPECT_EQ(numberOf(3, "b"), 9U);
    EXPECT_EQ(numberOf(44, "a"), 10U);
    EXPECT_EQ(tree.find(10), tree.ofType(44).front());
  }
}

TEST(NodeNumbers, OfEqualKindAndPositionFollowTheOrderInTheTree) {
  NodeTreeBuilder builder;
  for (int i = 0; i < 3; ++i) {
    builder.add(noParent, FirmwareNode, "same", std::to_string(i));
  }
  const NodeTree tree = builder.build();
  for (std::uint32_t i = 0; i < 3; ++i) {
    EXPECT_EQ(tree.description(i), std::to_string(i));
    EXPECT_EQ(tree.number(i), numberFor(FirmwareNode, "same", i + 1));
  }
}

NodeNumber badThenGood(int, std::string_view, std::uint32_t n) {
  return n == 1 ? noNumber : n == 2 ? overflowNumber : 40 + n;
}

TEST(NodeNumbers, AreNeverThoseOfMalformedIdentifiers) {
  NodeTreeBuilder builder;
  builder.add(noParent, FirmwareNode, "a", "");
  EXPECT_EQ(builder.build(badThenGood).number(0), 43U);
  for (const NodeNumber reserved : {noNumber, overflowNumber}) {
    builder.setNumber(builder.add(noParent, FirmwareNode, "a", ""), reserved);
    EXPECT_THROW(builder.build(), DuplicateNumber);
  }
}

TEST(NodeNumbers, GivenOutrightGoBeforeMadeOnes) {
  NodeTreeBuilder builder;
  builder.add(noParent, FirmwareNode, "a", "made");
  builder.setNumber(builder.add(noParent, DriverNode, "b", "given"), numberFor(FirmwareNode, "a"));
  const NodeTree tree = builder.build();
  EXPECT_EQ(tree.number(0), numberFor(FirmwareNode, "a", 2));
  EXPECT_EQ(tree.number(1), numberFor(FirmwareNode, "a"));
}

std::string messageOfBuild(NodeTreeBuilder& builder) {
  try {
    builder.build();
  } catch (const DuplicateNumber& error) {
    return error.what();
  }
  return "no error";
}

TEST(NodeNumbers, GivenTwiceAreRefused) {
  NodeTreeBuilder builder;
  builder.setNumber(builder.add(noParent, FirmwareNode, "a", "Drive"), 0x1a);
  builder.setNumber(builder.add(noParent, FirmwareNode, "b", "BIOS"), 0x1a);
  EXPECT_EQ(messageOfBuild(builder),
            "node number 1a is given to node 0 (\"Drive\") and to node 1 (\"BIOS\")");
  builder.setNumber(builder.add(noParent, FirmwareNode, "a", "Drive"), noNumber);
  EXPECT_EQ(messageOfBuild(builder),
            "node number 0, given to node 0 (\"Drive\"), is reserved and names no node");
}

// A parent is named by a handle when a tree is made, and by its number's path when it is climbed.

TEST(ParentLinks, ThatWouldFormACycleByHandlesAreRefused) {
  NodeTreeBuilder builder;
  const auto device = builder.add(noParent, NetworkDeviceNode, "a", "Network Device");
  for (const auto parent : {device + 1, device + 2}) {  // itself, and one that could then be put below it
    try {
      builder.add(parent, FirmwareNode, "b", "Network\nFirmware");
      FAIL() << "a node below " << parent;
    } catch (const std::invalid_argument& error) {
      EXPECT_THAT(error.what(), HasSubstr("node 1 (\"Network Firmware\") cannot stand below node " +
                                          std::to_string(parent) + ", which is not there yet"));
    }
  }
  EXPECT_EQ(builder.build().size(), 1U);
}

TEST(ParentLinks, ThatWouldFormACycleByNumbersAreRefused) {
  NodeTreeBuilder builder;
  const auto device = builder.add(noParent, NetworkDeviceNode, "a", "Network Device");
  const auto firmware = builder.add(device, FirmwareNode, "b", "Network Firmware");
  const auto part = builder.add(firmware, FirmwareNode, "c", "Boot Code");
  builder.setNumber(device, 0x1a);
  builder.setNumber(firmware, 0x1b);
  builder.setNumber(part, 0x1a);
  EXPECT_EQ(messageOfBuild(builder),
            "node number 1a is given to node 0 (\"Network Device\") and to node 2 "
            "(\"Boot Code\") below it: their parent links would form a cycle");
}

TEST(ParentLinks, LeadToARootFromEachNodeByNumbers) {
  for (std::uint64_t seed = 0; seed < 100; ++seed) {
    const NodeTree tree = testing::RandomTree(seed).make(100);
    for (NodeTree::Index node = 0; node < tree.size(); ++node) {
      std::size_t steps = 0;
      for (auto at = node; tree.parent(at) != NodeTree::none; at = tree.find(tree.number(tree.parent(at)))) {
        ASSERT_LT(++steps, tree.size());
      }
    }
  }
}

TEST(NodeTree, FindsEachNodeAndNoOther) {
  for (std::uint64_t seed = 0; seed < 200; ++seed) {
    const NodeTree tree = testing::RandomTree(seed).make(300);
    std::set<NodeNumber> numbers;
    for (NodeTree::Index node = 0; node < tree.size(); ++node) {
      ASSERT_TRUE(numbers.insert(tree.number(node)).second);
      ASSERT_EQ(tree.find(tree.number(node)), node);
    }
    for (NodeTree::Index node = 0; node < tree.size(); ++node) {
      const NodeNumber next = tree.number(node) + 1;
      ASSERT_EQ(tree.find(next) == NodeTree::none, !numbers.contains(next));
    }
    ASSERT_EQ(tree.find(noNumber), NodeTree::none);
    ASSERT_EQ(tree.find(overflowNumber), NodeTree::none);
  }
}

TEST(NodeTree, HasConsistentIndices) {
  for (std::uint64_t seed = 0; seed < 100; ++seed) {
    const NodeTree tree = testing::RandomTree(seed).make(100);
    std::map<int, std::vector<NodeTree::Index>> byType;
    for (NodeTree::Index node = 0; node < tree.size(); ++node) {
      byType[tree.type(node)].push_back(node);
      NodeTree::Index computer = node;
      while (computer != NodeTree::none && tree.type(computer) != ComputerSystemNode) {
        computer = tree.parent(computer);
      }
      ASSERT_EQ(tree.computer(node), computer);
      for (NodeTree::Index other = 0; other < tree.size(); ++other) {
        NodeTree::Index above = tree.parent(other);
        while (above != NodeTree::none && above != node) {
          above = tree.parent(above);
        }
        ASSERT_EQ(above == node, other > node && other < tree.subtreeEnd(node));
      }
    }
    for (const auto& [type, nodes] : byType) {
      const auto indexed = tree.ofType(type);
      ASSERT_EQ(std::vector(indexed.begin(), indexed.end()), nodes);
    }
  }
}

TEST(NodeTree, EqualsAnotherOfTheSameContentAlone) {
  const auto build = [](std::string_view version, std::uint32_t major, bool hasReport) {
    NodeTreeBuilder builder;
    const auto node = builder.add(noParent, FirmwareNode, "bios", "BIOS");
    builder.setValue(node, MajorVersionProperty, major);
    builder.setText(node, VersionStringProperty, version);
    if (hasReport) {
      builder.addReport({"dmi", "", SourceReport::Reason::Absent, ""});
    }
    return builder.build();
  };
  const NodeTree tree = build("1", 1, false);
  EXPECT_EQ(tree, build("1", 1, false));
  EXPECT_NE(tree, build("2", 1, false));
  EXPECT_NE(tree, build("1", 2, false));
  EXPECT_NE(tree, build("1", 1, true));
  EXPECT_NE(tree, NodeTree());

  NodeTreeBuilder builder;
  builder.setText(builder.add(noParent, FirmwareNode, "", ""), NameProperty, "dropped");
  builder.build();
  const auto node = builder.add(noParent, DriverNode, "x", "x");
  builder.describe(node, FirmwareNode, "bios", "BIOS");
  builder.setText(node, VersionStringProperty, "0");
  builder.setText(node, VersionStringProperty, "1");
  builder.setValue(node, MajorVersionProperty, 1);
  EXPECT_EQ(tree, builder.build()) << "however it came to be";
}

}  // namespace
}  // namespace agent
