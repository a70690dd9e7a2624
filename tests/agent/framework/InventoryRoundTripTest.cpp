// Writing and reading an inventory give the same tree.
#include "RandomTree.h"

#include <agent/framework/InventoryFile.h>

#include <Oru/NodeLexicon.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <chrono>
#include <fstream>
#include <string>

namespace agent {
namespace {

using namespace Oru::NodeLexicon;
using ::testing::HasSubstr;
constexpr auto noParent = NodeTreeBuilder::noParent;

TEST(InventoryRoundTrip, GivesEqualTreesWithTheSameNumbers) {
  for (std::uint64_t seed = 0; seed < 500; ++seed) {
    const NodeTree tree = testing::RandomTree(seed).make(seed % 5 == 0 ? 400 : 20);
    std::string text;
    try {
      text = writeInventory(tree);
    } catch (const InventoryError& error) {
      ASSERT_THAT(error.what(), HasSubstr("deeper"));
      continue;
    }
    const NodeTree read = parseInventory(text, "random.json");
    ASSERT_EQ(read, tree) << "seed " << seed;
    for (NodeTree::Index node = 0; node < tree.size(); ++node) {
      ASSERT_EQ(read.number(node), tree.number(node));
    }
    ASSERT_EQ(writeInventory(read), text) << "seed " << seed;
  }
}

TEST(InventoryRoundTrip, IsWrittenAsDocumented) {
  NodeTreeBuilder builder;
  const auto computer = builder.add(noParent, ComputerSystemNode, "computer", "");
  const auto bios = builder.add(computer, FirmwareNode, "bios", "BIOS");
  builder.setNumber(bios, 0xb105);
  builder.setText(bios, VersionStringProperty, "2.14 \"r\xC3\xA9v\"");
  builder.setValue(bios, MajorVersionProperty, 2);
  builder.setValue(bios, 4711, 4294967295U);
  builder.setNumber(builder.add(noParent, 1234, "", ""), 0x1a);
  builder.addReport({"dmi", "sys/class/dmi", SourceReport::Reason::TimedOut, ""});
  EXPECT_EQ(writeInventory(builder.build()), R"({
  "format": "swinv-inventory",
  "version": 1,
  "nodes": [
    {
      "type": "ComputerSystem",
      "position": "computer",
      "id": "1",
      "children": [
        {
          "type": "Firmware",
          "position": "bios",
          "id": "b105",
          "description": "BIOS",
          "properties": {
            "MajorVersion": 2,
            "VersionString": "2.14 \"r)"
                                             "\xC3\xA9"
                                             R"(v\"",
            "4711": 4294967295
          }
        }
      ]
    },
    {
      "type": 1234,
      "id": "1a"
    }
  ],
  "notRead": [
    {
      "source": "dmi",
      "path": "sys/class/dmi",
      "reason": "timedOut"
    }
  ]
}
)");
}

TEST(InventoryRoundTrip, TakesTheEmptyTree) {
  EXPECT_EQ(parseInventory(writeInventory(NodeTree()), "empty.json"), NodeTree());
}

TEST(InventoryRoundTrip, MakesNumbersFromTypeAndPositionWhereNoneIsGiven) {
  const NodeTree tree = parseInventory(R"({"version": 1, "format": "swinv-inventory", "nodes": [
    {"children": [{"position": "bios", "type": 3}, {"type": "Firmware", "position": "bios"}],
     "position": "computer", "type": "ComputerSystem"}]})",
                                       "brief.json");
  ASSERT_EQ(tree.size(), 3U);
  EXPECT_EQ(tree.number(0), computerNumber);
  EXPECT_EQ(tree.number(1), numberFor(FirmwareNode, "bios"));
  EXPECT_EQ(tree.number(2), numberFor(FirmwareNode, "bios", 2));
}

TEST(InventoryRoundTrip, HoldsAnyShape) {
  const NodeTree tree = parseInventory(R"({"format": "swinv-inventory", "version": 1, "nodes": [
    {"type": 44, "id": "AB"},
    {"type": "ComputerSystem", "position": "a", "children": [
      {"type": "ComputerSystem", "position": "b", "children": [{"type": "Driver", "children": [{"type": "Bios"}]}]}]},
    {"type": "ApplicationSoftware"}, {"type": "Device"}]})",
                                       "odd.json");
  ASSERT_EQ(tree.size(), 7U);
  EXPECT_EQ(tree.number(0), 0xabU);
  EXPECT_EQ(tree.type(4), BiosNode);
  EXPECT_EQ(tree.computer(4), 2U);
  EXPECT_EQ(tree.ofType(ComputerSystemNode).size(), 2U);
  EXPECT_FALSE(tree.text(1, NameProperty).has_value());
}

NodeTreeBuilder chain(std::size_t depth) {
  NodeTreeBuilder builder;
  auto node = NodeTreeBuilder::noParent;
  for (std::size_t i = 0; i < depth; ++i) {
    node = builder.add(node, FirmwareNode, std::to_string(i), "");
  }
  return builder;
}

TEST(InventoryRoundTrip, GoesDownToTheGreatestDepthAndNoDeeper) {
  const NodeTree deepest = chain(InventoryBounds::depth).build();
  EXPECT_EQ(parseInventory(writeInventory(deepest), "deep.json"), deepest);
  EXPECT_THROW(writeInventory(chain(InventoryBounds::depth + 1).build()), InventoryError);
}

TEST(InventoryRoundTrip, GoesUpToTheGreatestNumberOfPropertiesAndNoFurther) {
  NodeTreeBuilder builder;
  for (const std::size_t count : {InventoryBounds::propertiesOfNode, InventoryBounds::propertiesOfNode + 1}) {
    const auto node = builder.add(noParent, FirmwareNode, "", "");
    for (std::size_t i = 0; i < count; ++i) {
      builder.setValue(node, static_cast<int>(2000 + i), 1);
    }
    const NodeTree tree = builder.build();
    if (count == InventoryBounds::propertiesOfNode) {
      EXPECT_EQ(parseInventory(writeInventory(tree), "wide.json"), tree);
    } else {
      EXPECT_THROW(writeInventory(tree), InventoryError);
    }
  }
}

TEST(InventoryRoundTrip, HoldsTwoHundredThousandNodes) {
  NodeTreeBuilder builder;
  const auto computer = builder.add(noParent, ComputerSystemNode, computerPosition, "Computer System");
  for (int i = 0; i < 200'000; ++i) {
    const auto node =
        builder.add(computer, i % 2 == 0 ? FirmwareNode : DriverNode, "bus:" + std::to_string(i), "A part");
    builder.setText(node, VersionStringProperty, "1." + std::to_string(i));
    builder.setText(node, ManufacturerProperty, "Norvane");
  }
  const NodeTree tree = builder.build();
  EXPECT_EQ(parseInventory(writeInventory(tree), "big.json"), tree);
}

TEST(InventoryFile, IsReadFromDisk) {
  const std::string path = ::testing::TempDir() + "swinv-inventory-file-test.json";
  const NodeTree tree = testing::RandomTree(3).make(40);
  std::ofstream(path, std::ios::binary) << writeInventory(tree);
  EXPECT_EQ(readInventoryFile(path), tree);
  std::filesystem::remove(path);
}

TEST(InventoryFile, SaysWhyItCannotBeRead) {
  for (const auto& [path, reason] :
       {std::pair{::testing::TempDir() + "no-such-inventory.json", "No such file"},
        {::testing::TempDir(), "directory"}}) {
    try {
      readInventoryFile(path);
      ADD_FAILURE() << path;
    } catch (const InventoryError& error) {
      EXPECT_THAT(error.what(), HasSubstr(path));
      EXPECT_THAT(error.what(), HasSubstr(reason));
    }
  }
}

}  // namespace
}  // namespace agent
