#include <cli/TreeMarks.h>
#include <cli/TreePrinter.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace {

using agent::NodeTreeBuilder;
namespace lexicon = Oru::NodeLexicon;
using Handle = NodeTreeBuilder::Handle;

/// A tree whose nodes have the numbers 1, 2, 3, ... in the order in which they were added.
class Marks : public testing::Test {
 protected:
  Handle add(Handle parent, int type, std::string_view description, std::string_view name = {}) {
    const Handle node = builder_.add(parent, type, std::to_string(count_), description);
    builder_.setNumber(node, ++count_);
    builder_.setText(node, lexicon::NameProperty, name);
    return node;
  }
  Handle computer(std::string_view name) {
    return add(NodeTreeBuilder::noParent, lexicon::ComputerSystemNode, "Computer System", name);
  }
  /// Of the tree that was added until now, the mark of the node that was added last of that number.
  std::string markOf(agent::NodeNumber number) {
    if (tree_.size() == 0) {
      tree_ = builder_.build();
    }
    return cli::associationMark(tree_, tree_.find(number));
  }

 private:
  NodeTreeBuilder builder_;
  agent::NodeNumber count_ = 0;
  agent::NodeTree tree_;
};

TEST_F(Marks, SoftwareIsOnTheNearestComputerAboveIt) {
  const Handle outer = computer("outer");
  const Handle inner = add(outer, lexicon::ComputerSystemNode, "Computer System", "inner");
  const Handle device = add(inner, 1000, "Drive");
  add(device, lexicon::FirmwareNode, "Drive Firmware");
  add(outer, lexicon::DriverNode, "driver");
  add(outer, lexicon::BiosNode, "backup");
  EXPECT_EQ(markOf(4), "on inner");
  EXPECT_EQ(markOf(5), "on outer");
  EXPECT_EQ(markOf(6), "on outer");
}

TEST_F(Marks, SoftwareOnNoComputerOrOnOneWithoutANameIsUnmarked) {
  add(NodeTreeBuilder::noParent, lexicon::FirmwareNode, "BIOS");
  const Handle unnamed = computer("");
  add(unnamed, lexicon::FirmwareNode, "BIOS");
  add(unnamed, lexicon::FirmwareNode, "BMC Firmware");
  EXPECT_EQ(markOf(1), "");
  EXPECT_EQ(markOf(3), "");
  EXPECT_EQ(markOf(4), "");
}

TEST_F(Marks, TheExactDescriptionMakesABiosAndAServiceProcessor) {
  const Handle atlas = computer("atlas");
  add(atlas, lexicon::FirmwareNode, "BIOS");
  add(atlas, lexicon::FirmwareNode, "BMC Firmware");
  add(atlas, lexicon::FirmwareNode, "BMC firmware");
  add(atlas, lexicon::FirmwareNode, "BIOS ");  // blanks at the ends are no part of a description
  add(atlas, lexicon::FirmwareNode, "BIOS backup");
  add(atlas, lexicon::BiosNode, "BIOS");
  add(atlas, lexicon::DriverNode, "BMC Firmware");
  EXPECT_EQ(markOf(2), "on atlas, is its BIOS");
  EXPECT_EQ(markOf(3), "on atlas, runs its service processor");
  EXPECT_EQ(markOf(4), "on atlas");
  EXPECT_EQ(markOf(5), "on atlas, is its BIOS");
  EXPECT_EQ(markOf(6), "on atlas");
  EXPECT_EQ(markOf(7), "on atlas");
  EXPECT_EQ(markOf(8), "on atlas");
}

TEST_F(Marks, SoftwareBelowANetworkDeviceServesTheFirstPort) {
  const Handle atlas = computer("atlas");
  const Handle before = add(atlas, lexicon::NetworkDeviceNode, "Network Device");
  add(before, lexicon::NetworkPortNode, "eth0", "card0/1");
  const Handle device = add(atlas, lexicon::NetworkDeviceNode, "Network Device");
  add(device, lexicon::FirmwareNode, "Network Firmware");
  add(device, lexicon::NetworkPortNode, "eth1", "card1/1");
  add(device, lexicon::NetworkPortNode, "eth2", "card1/2");
  add(device, lexicon::DriverNode, "driver");
  EXPECT_EQ(markOf(5), "on atlas, serves port card1/1");
  EXPECT_EQ(markOf(8), "on atlas, serves port card1/1");
}

TEST_F(Marks, TheFirstPortMayLieDeeper) {
  const Handle device = add(computer("atlas"), lexicon::NetworkDeviceNode, "Network Device");
  add(device, lexicon::FirmwareNode, "Network Firmware");
  const Handle module = add(device, 1000, "Module");
  add(module, lexicon::NetworkPortNode, "eth0", "module/1");
  add(device, lexicon::NetworkPortNode, "eth1", "card/1");
  EXPECT_EQ(markOf(3), "on atlas, serves port module/1");
}

TEST_F(Marks, FirmwareThatLiesDeeperServesNone) {
  const Handle device = add(computer("atlas"), lexicon::NetworkDeviceNode, "Network Device");
  add(device, lexicon::NetworkPortNode, "eth0", "card/1");
  const Handle module = add(device, 1000, "Module");
  add(module, lexicon::FirmwareNode, "Network Firmware");
  EXPECT_EQ(markOf(5), "on atlas");
}

TEST_F(Marks, APortOnNoComputerThatHasANameIsServedByNone) {
  const Handle device = add(NodeTreeBuilder::noParent, lexicon::NetworkDeviceNode, "Network Device");
  add(device, lexicon::FirmwareNode, "Network Firmware");
  add(device, lexicon::NetworkPortNode, "eth0", "card/1");
  EXPECT_EQ(markOf(2), "");
}

TEST_F(Marks, ADeviceWithoutPortsOrWhoseFirstPortHasNoNameIsServedByNone) {
  const Handle atlas = computer("atlas");
  const Handle bare = add(atlas, lexicon::NetworkDeviceNode, "Network Device");
  add(bare, lexicon::FirmwareNode, "Network Firmware");
  const Handle nameless = add(atlas, lexicon::NetworkDeviceNode, "Network Device");
  add(nameless, lexicon::FirmwareNode, "Network Firmware");
  add(nameless, lexicon::NetworkPortNode, "eth0");
  add(nameless, lexicon::NetworkPortNode, "eth1", "card/2");
  EXPECT_EQ(markOf(3), "on atlas");
  EXPECT_EQ(markOf(5), "on atlas");
}

TEST(TreePrinter, MarksStandBehindASemicolon) {
  NodeTreeBuilder builder;
  const auto atlas = builder.add(NodeTreeBuilder::noParent, lexicon::ComputerSystemNode, "computer", "host");
  builder.setNumber(atlas, 1);
  builder.setText(atlas, lexicon::NameProperty, "at\x1blas");
  const auto device = builder.add(atlas, lexicon::NetworkDeviceNode, "card", "Network Device");
  builder.setNumber(device, 2);
  const auto firmware = builder.add(device, lexicon::FirmwareNode, "firmware", "Network Firmware");
  builder.setNumber(firmware, 3);
  builder.setText(firmware, lexicon::VersionStringProperty, "1.5");
  const auto port = builder.add(device, lexicon::NetworkPortNode, "port", "eth0");
  builder.setNumber(port, 4);
  builder.setText(port, lexicon::NameProperty, "card/1");
  EXPECT_EQ(cli::printTree(builder.build(), {}),
            "ComputerSystem host (at las)  [1]\n"
            "└─ NetworkDevice Network Device  [2]\n"
            "   ├─ Firmware Network Firmware, version 1.5; on at las, serves port card/1  [2@3]\n"
            "   └─ NetworkPort eth0 (card/1)  [4]\n");
}

}  // namespace
