// Module versions through libkmod, below another root.
#include "Machine.h"
#include "ModuleFiles.h"

#include <gtest/gtest.h>

#include <cerrno>

namespace agent::discovery::test {
namespace {

constexpr const char* folder = "usr/lib/modules/6.1.0/";

void addLoadable(Machine& machine, const std::string& name, std::string_view info) {
  machine.write(folder + std::string("kernel/") + name + ".ko", moduleFile(info));
  machine.write(folder + std::string("modules.dep.bin"), indexFile(name, "kernel/" + name + ".ko:"));
}

void addBuiltIn(Machine& machine, const std::string& name, const std::string& info) {
  machine.write(folder + std::string("modules.builtin.bin"), indexFile(name, "kernel/" + name + ".ko"));
  machine.write(folder + std::string("modules.builtin.modinfo"), name + "." + info + '\0');
}

TEST(ModuleDatabaseTest, ReadsTheVersionOfAModuleFile) {
  Machine machine("");
  addLoadable(machine, "gig", "version=5.6.0-k");
  const auto modules = makeModuleDatabase(machine.root() / folder);
  ASSERT_NE(modules, nullptr);
  const auto answer = modules->version("gig");
  EXPECT_EQ(answer.error, 0);
  EXPECT_EQ(answer.version, "5.6.0-k");
}

TEST(ModuleDatabaseTest, AModuleWithoutAVersionHasNone) {
  Machine machine("");
  addLoadable(machine, "gig", "license=GPL");
  const auto answer = makeModuleDatabase(machine.root() / folder)->version("gig");
  EXPECT_EQ(answer.error, 0);
  EXPECT_EQ(answer.version, std::nullopt);
}

TEST(ModuleDatabaseTest, ReadsTheVersionOfABuiltInModule) {
  Machine machine("");
  addBuiltIn(machine, "ring", "version=2.0.3");
  const auto answer = makeModuleDatabase(machine.root() / folder)->version("ring");
  EXPECT_EQ(answer.error, 0);
  EXPECT_EQ(answer.version, "2.0.3");
}

TEST(ModuleDatabaseTest, AnUnknownModuleAndAnEmptyFolderAreNoEntry) {
  Machine machine("");
  addLoadable(machine, "gig", "version=1");
  EXPECT_EQ(makeModuleDatabase(machine.root() / folder)->version("other").error, ENOENT);
  EXPECT_EQ(makeModuleDatabase(machine.root() / "nothing")->version("gig").error, ENOENT);
}

TEST(ModuleDatabaseTest, AFileThatIsNoModuleIsAnError) {
  Machine machine("");
  addLoadable(machine, "gig", "version=1");
  machine.write(folder + std::string("kernel/gig.ko"), "no module at all");
  const auto answer = makeModuleDatabase(machine.root() / folder)->version("gig");
  EXPECT_NE(answer.error, 0);
  EXPECT_NE(answer.error, ENOENT);
  EXPECT_EQ(answer.version, std::nullopt);
}

TEST(ModuleDatabaseTest, DiscoveryFindsTheDatabaseOfTheRunningRelease) {
  Machine machine(R"(
    proc/sys/kernel/osrelease = 6.1.0
    lib -> usr/lib
    sys/bus/pci/devices/0/driver -> ../../drivers/gig
    sys/bus/pci/drivers/gig/module -> ../../../../module/gig
    sys/bus/pci/devices/1/driver -> ../../drivers/ring
  )");
  addLoadable(machine, "gig", "version=5.6.0-k");
  addBuiltIn(machine, "ring", "version=2.0.3");
  const NodeTree tree = discoverAt(machine);
  EXPECT_EQ(tree.text(described(tree, "gig driver"), Oru::NodeLexicon::DriverVersionProperty), "5.6.0-k");
  EXPECT_EQ(tree.text(described(tree, "ring driver"), Oru::NodeLexicon::DriverVersionProperty), "2.0.3");
  EXPECT_FALSE(reportOn(tree, "drivers", ""));
}

}  // namespace
}  // namespace agent::discovery::test
