#include "Machine.h"

#include <agent/discovery/SystemRoot.h>

#include <gtest/gtest.h>

#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>

namespace agent::discovery::test {
namespace {

TEST(SystemRootTest, OnlyTheSystemsOwnRootIsLive) {
  EXPECT_TRUE(SystemRoot("/").isLive());
  EXPECT_TRUE(SystemRoot("").isLive());
  EXPECT_TRUE(SystemRoot("//").isLive());
  EXPECT_TRUE(SystemRoot("/tmp/..").isLive());
  EXPECT_FALSE(SystemRoot("/tmp").isLive());
  EXPECT_FALSE(SystemRoot(".").isLive());
  EXPECT_EQ(SystemRoot("/").outside("sys/bus"), "/sys/bus");
  EXPECT_EQ(SystemRoot("/tmp/").outside("sys/bus"), "/tmp/sys/bus");
}

TEST(SystemRootTest, FollowsLinksToTheFileItself) {
  const Machine machine(R"(
    a/b/value = 7
    a/link -> b
    other -> a/link
    dots/deep/link -> ../../a/./b
  )");
  const SystemRoot root(machine.root());
  EXPECT_EQ(root.resolve("other/value").value, "a/b/value");
  EXPECT_EQ(root.resolve("dots/deep/link/value").value, "a/b/value");
  EXPECT_EQ(root.read("other/value").value, "7\n");
}

TEST(SystemRootTest, NoLinkLeadsOutOfTheRoot) {
  const Machine machine(R"(
    etc/hostname = inside
    absolute -> /etc/hostname
    upward -> ../../../../../../../../etc/hostname
    passwd -> /etc/passwd
  )");
  const SystemRoot root(machine.root());
  EXPECT_EQ(root.read("absolute").value, "inside\n");
  EXPECT_EQ(root.read("upward").value, "inside\n");
  EXPECT_EQ(root.read("../../etc/hostname").value, "inside\n");
  EXPECT_EQ(root.read("passwd").error, ENOENT);
}

TEST(SystemRootTest, LinksInACircleEnd) {
  const Machine machine("a -> b\nb -> a\nself -> self/self");
  const SystemRoot root(machine.root());
  EXPECT_EQ(root.read("a").error, ELOOP);
  EXPECT_EQ(root.resolve("self").error, ELOOP);
}

TEST(SystemRootTest, ReadsUpToTheLimitAndNoFurther) {
  Machine machine("");
  machine.write("exact", std::string(100, 'x'));
  machine.write("above", std::string(101, 'x'));
  machine.write("empty", "");
  const SystemRoot root(machine.root());
  EXPECT_EQ(root.read("exact", 100).value, std::string(100, 'x'));
  EXPECT_EQ(root.read("above", 100).error, EFBIG);
  EXPECT_EQ(root.read("empty").value, "");
}

TEST(SystemRootTest, ReadsFilesAlone) {
  const Machine machine("folder/value = 1");
  ASSERT_EQ(::mkfifo((machine.root() / "pipe").c_str(), 0600), 0);
  const SystemRoot root(machine.root());
  EXPECT_EQ(root.read("folder").error, EISDIR);
  EXPECT_EQ(root.read("pipe").error, EINVAL) << "and does not wait for a writer";
  EXPECT_EQ(root.read("nothing").error, ENOENT);
  EXPECT_EQ(root.read("folder/value/below").error, ENOTDIR);
}

TEST(SystemRootTest, ReadsTheRunningSystem) {
  const SystemRoot root("/");
  const auto release = root.read("proc/sys/kernel/osrelease");
  ASSERT_TRUE(release);
  EXPECT_GT(release.value->size(), 1U);
  EXPECT_TRUE(root.read("proc/self/comm")) << "through a link";
  EXPECT_EQ(root.linkedName("proc/self").value, std::to_string(::getpid()));
  EXPECT_EQ(root.read("proc").error, EISDIR);
  EXPECT_EQ(root.read("dev/null").error, EINVAL);
}

TEST(SystemRootTest, ListsNamesInOrder) {
  const Machine machine("d/b = 1\nd/a/x = 2\nd/c -> nowhere");
  const SystemRoot root(machine.root());
  EXPECT_EQ(root.list("d").value, (std::vector<std::string>{"a", "b", "c"}));
  EXPECT_EQ(root.list("d/b").error, ENOTDIR);
  EXPECT_EQ(root.list("nothing").error, ENOENT);
}

TEST(SystemRootTest, NamesTheTargetOfALink) {
  const Machine machine(
      "bus/dev/driver -> ../../drivers/gig/\nbus/dev/odd -> ..\nbus/alias -> dev\nbus/file = 1");
  const SystemRoot root(machine.root());
  EXPECT_EQ(root.linkedName("bus/dev/driver").value, "gig") << "which need not exist";
  EXPECT_EQ(root.linkedName("bus/alias/driver").value, "gig");
  EXPECT_EQ(root.linkedName("bus/dev/odd").error, EINVAL);
  EXPECT_EQ(root.linkedName("bus/file").error, EINVAL);
  EXPECT_EQ(root.linkedName("bus/none/driver").error, ENOENT);
}

TEST(PathText, IsTakenApartAndPutTogether) {
  EXPECT_EQ(lastName("a/b"), "b");
  EXPECT_EQ(lastName("a"), "a");
  EXPECT_EQ(parentFolder("a/b/c"), "a/b");
  EXPECT_EQ(parentFolder("a"), "");
  EXPECT_EQ(within("a", "b"), "a/b");
  EXPECT_EQ(within("", "b"), "b");
}

}  // namespace
}  // namespace agent::discovery::test
