// Which source the tree is read from.
#include <agent/framework/InventoryFile.h>
#include <agent/framework/TreeSource.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <memory>
#include <optional>
#include <string>

namespace agent {
namespace {

using namespace Oru::NodeLexicon;
using ::testing::HasSubstr;

class ConfiguredTree : public ::testing::Test {
 protected:
  void SetUp() override {
    unsetenv("ORU_INVENTORY");
    unsetenv("ORU_SYSTEM_ROOT");
    std::string pattern = ::testing::TempDir() + "swinv-source-XXXXXX";
    ASSERT_NE(mkdtemp(pattern.data()), nullptr);
    folder = pattern;
  }
  void TearDown() override { std::filesystem::remove_all(folder); }

  void write(const std::string& path, const std::string& text) const {
    std::filesystem::create_directories((folder / path).parent_path());
    std::ofstream(folder / path) << text;
  }

  std::filesystem::path folder;
};

TEST_F(ConfiguredTree, IsTheLiveMachineWhereNothingIsSet) {
  const TreeSource source = TreeSource::fromEnvironment();
  EXPECT_FALSE(source.inventory.has_value());
  EXPECT_FALSE(source.systemRoot.has_value());
  const NodeTree tree = readTree(source);
  ASSERT_EQ(tree.ofType(ComputerSystemNode).size(), 1U);
  EXPECT_EQ(tree.number(0), computerNumber);
}

TEST_F(ConfiguredTree, EmptyVariablesCountAsNotSet) {
  setenv("ORU_INVENTORY", "", 1);
  setenv("ORU_SYSTEM_ROOT", "", 1);
  const TreeSource source = TreeSource::fromEnvironment();
  EXPECT_FALSE(source.inventory.has_value());
  EXPECT_FALSE(source.systemRoot.has_value());
}

TEST_F(ConfiguredTree, IsReadBelowASystemRoot) {
  write("sys/class/dmi/id/bios_version", "F42.7-of-the-test\n");
  setenv("ORU_SYSTEM_ROOT", folder.c_str(), 1);
  const NodeTree tree = readTree(TreeSource::fromEnvironment());
  const auto firmware = tree.ofType(FirmwareNode);
  ASSERT_EQ(firmware.size(), 1U);
  EXPECT_EQ(tree.text(firmware.front(), VersionStringProperty), "F42.7-of-the-test");
}

TEST_F(ConfiguredTree, IsReadFromAnInventoryBeforeASystemRoot) {
  NodeTreeBuilder builder;
  builder.add(NodeTreeBuilder::noParent, DriverNode, "x", "the only node");
  const NodeTree saved = builder.build();
  write("machine.json", writeInventory(saved));
  setenv("ORU_INVENTORY", (folder / "machine.json").c_str(), 1);
  setenv("ORU_SYSTEM_ROOT", folder.c_str(), 1);
  EXPECT_EQ(readTree(TreeSource::fromEnvironment()), saved);
}

TEST_F(ConfiguredTree, LiveMachineAloneHasEvents) {
  const std::unique_ptr<Events> events = eventsOf({});
  ASSERT_NE(events, nullptr);
  events->stop();
  EXPECT_FALSE(events->waitForChange());
  EXPECT_EQ(eventsOf({folder / "machine.json", std::nullopt}), nullptr);
  EXPECT_EQ(eventsOf({std::nullopt, folder}), nullptr);
}

TEST_F(ConfiguredTree, FailsWithTheReasonWhereTheInventoryIsBroken) {
  write("machine.json", "{\n\"nodes\": 1}");
  try {
    readTree({folder / "machine.json", std::nullopt});
    FAIL() << "a broken inventory is not an empty machine";
  } catch (const std::runtime_error& error) {
    EXPECT_THAT(error.what(), HasSubstr("machine.json:2: nodes: expected an array of nodes, got 1"));
  }
}

TEST_F(ConfiguredTree, SavedMachineShowsTheSameNumbers) {
  write("sys/class/dmi/id/bios_version", "1\n");
  const NodeTree found = readTree({std::nullopt, folder});
  EXPECT_EQ(parseInventory(writeInventory(found), "captured"), found);
}

}  // namespace
}  // namespace agent
