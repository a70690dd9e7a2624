// tree and capture, as a process.
#include "Process.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>

namespace {

using cli_test::readFile;
using cli_test::Result;
using cli_test::run;
using cli_test::swinv;
using cli_test::TemporaryFolder;
using cli_test::testFile;
using testing::AllOf;
using testing::HasSubstr;

const std::string small = testFile("tests/cli/small.json");
const std::string server = testFile("examples/server.json");

void expectDone(const Result& result) {
  EXPECT_EQ(result.exitCode, 0);
  EXPECT_EQ(result.standardError, "");
}

TEST(TreeCommand, ShowsNodesAndWhatCouldNotBeRead) {
  const Result result = swinv({"tree", "--inventory", small});
  expectDone(result);
  EXPECT_EQ(
      result.standardOutput,
      "ComputerSystem alpha  [1]\n"
      "├─ Firmware BIOS, version 2.4.1  [1@2a]\n"
      "├─ NetworkDevice Network Device  [26]\n"
      "│  └─ Firmware Boot code with a description that is longer than any terminal of these tests is wide"
      " (Boot \"code\")  [26@abc]\n"
      "└─ Driver velmor25 driver, version 5.1, drives pci:0000:01:00.0  [1@d]\n"
      "\n"
      "Could not be read:\n"
      "  dmi: sys/class/dmi/id/bios_date: no permission (Permission denied)\n");
}

TEST(TreeCommand, IsAsciiWithoutAUtf8Locale) {
  const Result result = run({{"tree", "--inventory", server}, {{"LC_ALL", "C"}}});
  expectDone(result);
  EXPECT_THAT(result.standardOutput, AllOf(HasSubstr("|- Firmware"), HasSubstr("`- Driver")));
  EXPECT_TRUE(std::all_of(result.standardOutput.begin(), result.standardOutput.end(),
                          [](char c) { return static_cast<unsigned char>(c) < 0x80; }));
}

TEST(TreeCommand, ShowsAnEmptySystemRoot) {
  const TemporaryFolder folder;
  const Result result = swinv({"tree", "--system-root", folder.at("").string()});
  expectDone(result);
  EXPECT_THAT(result.standardOutput, AllOf(HasSubstr("ComputerSystem"), HasSubstr("Could not be read:\n")));
}

TEST(TreeCommand, JsonIsTheInventory) {
  const TemporaryFolder folder;
  const std::string file = folder.at("captured.json");
  expectDone(swinv({"capture", file, "--inventory", small}));
  const Result json = swinv({"tree", "--format", "json", "--inventory", small});
  expectDone(json);
  EXPECT_EQ(json.standardOutput, readFile(file));
}

TEST(CaptureCommand, ACapturedMachineIsTheSameMachine) {
  const TemporaryFolder folder;
  const std::string once = folder.at("once.json");
  const std::string twice = folder.at("twice.json");
  expectDone(swinv({"capture", once, "--inventory", server}));
  expectDone(swinv({"capture", twice, "--inventory", once}));
  EXPECT_EQ(readFile(once), readFile(twice));
  EXPECT_EQ(folder.entries(), 2U);
  for (const char* command : {"list", "names", "tree"}) {
    EXPECT_EQ(swinv({command, "--format", "json", "--inventory", once}).standardOutput,
              swinv({command, "--format", "json", "--inventory", server}).standardOutput)
        << command;
  }
}

TEST(CaptureCommand, TheLiveMachineKeepsItsInstanceIds) {
  const TemporaryFolder folder;
  const std::string file = folder.at("live.json");
  expectDone(swinv({"capture", file}));
  EXPECT_EQ(swinv({"list", "--inventory", file, "--property", "InstanceID"}).standardOutput,
            swinv({"list", "--property", "InstanceID"}).standardOutput);
}

TEST(CaptureCommand, ADashIsStandardOutput) {
  const TemporaryFolder folder;
  const std::string file = folder.at("f.json");
  expectDone(swinv({"capture", file, "--inventory", small}));
  const Result result = swinv({"capture", "-", "--inventory", small});
  expectDone(result);
  EXPECT_EQ(result.standardOutput, readFile(file));
}

TEST(CaptureCommand, AnExistingFileIsReplacedOnlyWithForce) {
  const TemporaryFolder folder;
  const std::string file = folder.at("f.json");
  expectDone(swinv({"capture", file, "--inventory", small}));
  const std::string before = readFile(file);
  const Result refused = swinv({"capture", file, "--inventory", server});
  EXPECT_EQ(refused.exitCode, 1);
  EXPECT_THAT(refused.standardError, AllOf(HasSubstr("f.json exists"), HasSubstr("--force")));
  EXPECT_EQ(readFile(file), before);
  expectDone(swinv({"capture", file, "--inventory", server, "--force"}));
  EXPECT_NE(readFile(file), before);
  EXPECT_EQ(folder.entries(), 1U);
}

TEST(CaptureCommand, AFileThatCannotBeWrittenIsNamed) {
  const TemporaryFolder folder;
  const Result result = swinv({"capture", folder.at("missing/f.json").string(), "--inventory", small});
  EXPECT_EQ(result.exitCode, 1);
  EXPECT_THAT(result.standardError,
              AllOf(HasSubstr("missing/f.json"), HasSubstr("No such file or directory")));
}

}  // namespace
