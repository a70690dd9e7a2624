// The built program with stand-ins for the tools of other object managers on its PATH, which write down how
// they were called.
#include "Process.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>

namespace {

namespace fs = std::filesystem;

using cli_test::linesOf;
using cli_test::readFile;
using cli_test::Result;
using cli_test::TemporaryFolder;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::StartsWith;

class RegisterCommand : public testing::Test {
 protected:
  [[nodiscard]] fs::path toolFile(const std::string& name) const { return folder_.at(name.c_str()); }

  /// A tool that adds a line with its name and its arguments, one in each pair of brackets, to the record.
  void makeTool(const std::string& name, int exitStatus = 0) const {
    const fs::path file = toolFile(name);
    std::ofstream(file) << "#!/bin/sh\n{ printf '%s' " << name
                        << "; for each in \"$@\"; do printf ' [%s]' \"$each\"; done; echo; } >> "
                        << folder_.at("record").string() << "\necho from " << name << "\nexit " << exitStatus
                        << "\n";
    fs::permissions(file, fs::perms::owner_all);
  }
  void makeAllTools() const {
    for (const char* name : {"sfcbstage", "sfcbunstage", "sfcbrepos", "cimmof", "cimprovider"}) {
      makeTool(name);
    }
  }
  [[nodiscard]] Result swinv(std::vector<std::string> arguments) const {
    return cli_test::run(
        {.arguments = std::move(arguments), .environment = {{"PATH", folder_.at(".").string()}}});
  }
  /// The calls of the tools, with the schema's folder as "S".
  [[nodiscard]] std::vector<std::string> calls() const {
    return fs::exists(folder_.at("record")) ? linesOf(shortened(readFile(folder_.at("record"))))
                                            : std::vector<std::string>{};
  }
  static std::string shortened(std::string text) {
    const std::string schema =
        (fs::canonical(SWINV_PROGRAM).parent_path().parent_path() / "share" / "swinv" / "schema").string();
    for (std::size_t at = text.find(schema); at != std::string::npos; at = text.find(schema)) {
      text.replace(at, schema.size(), "S");
    }
    return text;
  }

 private:
  TemporaryFolder folder_;
};

TEST_F(RegisterCommand, StagesForSfcbWithItsTools) {
  makeAllTools();
  const Result result = swinv({"register", "--for", "sfcb"});
  EXPECT_EQ(result.exitCode, 0) << result.standardError;
  EXPECT_THAT(
      calls(),
      ElementsAre("sfcbstage [-n] [root/cimv2] [-r] [S/registration/sfcb/KelvoEndpointProvider.reg] "
                  "[S/KELVO_Endpoints.mof]",
                  "sfcbstage [-n] [root/cimv2] [-r] [S/registration/sfcb/SoftwareInventoryProvider.reg] "
                  "[S/KELVO_SoftwareInventory.mof]",
                  "sfcbrepos [-f]"));
  const std::vector<std::string> lines = linesOf(result.standardOutput);
  ASSERT_EQ(lines.size(), 7U) << result.standardOutput;
  EXPECT_THAT(lines[0], StartsWith("sfcbstage -n root/cimv2 -r "));
  EXPECT_EQ(lines[1], "from sfcbstage") << "what a tool prints stands below its line";
  EXPECT_THAT(lines[6], HasSubstr("sfcb must find them there, and be restarted"));
}

TEST_F(RegisterCommand, CompilesForPegasusWithItsTools) {
  makeAllTools();
  EXPECT_EQ(swinv({"register", "--for", "pegasus"}).exitCode, 0);
  EXPECT_THAT(calls(),
              ElementsAre("cimmof [-n] [root/cimv2] [S/KELVO_Endpoints.mof] [S/KELVO_SoftwareInventory.mof]",
                          "cimmof [-n] [root/PG_InterOp] [S/registration/pegasus/KelvoEndpointProvider.mof] "
                          "[S/registration/pegasus/SoftwareInventoryProvider.mof]",
                          "cimprovider [-l] [-m] [KelvoEndpointProviderModule]",
                          "cimprovider [-l] [-m] [SoftwareInventoryProviderModule]"));
}

TEST_F(RegisterCommand, UnregistersWithTheirTools) {
  makeAllTools();
  EXPECT_EQ(swinv({"unregister", "--for", "pegasus"}).exitCode, 0);
  EXPECT_EQ(swinv({"unregister", "--for", "sfcb"}).exitCode, 0);
  EXPECT_THAT(
      calls(),
      ElementsAre("cimprovider [-r] [-m] [SoftwareInventoryProviderModule]",
                  "cimprovider [-r] [-m] [KelvoEndpointProviderModule]",
                  "sfcbunstage [-n] [root/cimv2] [-r] [S/registration/sfcb/SoftwareInventoryProvider.reg] "
                  "[S/KELVO_SoftwareInventory.mof]",
                  "sfcbunstage [-n] [root/cimv2] [-r] [S/registration/sfcb/KelvoEndpointProvider.reg] "
                  "[S/KELVO_Endpoints.mof]",
                  "sfcbrepos [-f]"));
}

TEST_F(RegisterCommand, PrintsAndRunsNothing) {
  makeAllTools();
  for (const char* manager : {"sfcb", "pegasus"}) {
    for (const char* command : {"register", "unregister"}) {
      const Result printed = swinv({command, "--for", manager, "--print"});
      EXPECT_EQ(printed.exitCode, 0) << printed.standardError;
      EXPECT_THAT(calls(), IsEmpty());
      EXPECT_GE(linesOf(printed.standardOutput).size(), 2U);
    }
  }
}

TEST_F(RegisterCommand, PrintsWhatAShellRunsTheSame) {
  const Result printed = swinv({"register", "--for", "sfcb", "--print"});
  EXPECT_EQ(printed.exitCode, 0) << "no tool is needed";
  EXPECT_THAT(linesOf(shortened(printed.standardOutput)),
              ElementsAre("sfcbstage -n root/cimv2 -r S/registration/sfcb/KelvoEndpointProvider.reg "
                          "S/KELVO_Endpoints.mof",
                          "sfcbstage -n root/cimv2 -r S/registration/sfcb/SoftwareInventoryProvider.reg "
                          "S/KELVO_SoftwareInventory.mof",
                          "sfcbrepos -f"));
}

TEST_F(RegisterCommand, RunsNothingWhereAToolIsMissing) {
  makeTool("sfcbstage");
  const Result result = swinv({"register", "--for", "sfcb"});
  EXPECT_EQ(result.exitCode, 1);
  EXPECT_THAT(result.standardError, HasSubstr("there is no sfcbrepos on PATH; it comes with sfcb"));
  EXPECT_THAT(result.standardError, HasSubstr("--print"));
  EXPECT_THAT(calls(), IsEmpty());
  EXPECT_THAT(swinv({"unregister", "--for", "pegasus"}).standardError,
              HasSubstr("there is no cimprovider on PATH; it comes with OpenPegasus"));
}

TEST_F(RegisterCommand, EndsWithTheFirstToolThatFails) {
  makeAllTools();
  makeTool("sfcbstage", 3);
  const Result result = swinv({"register", "--for", "sfcb"});
  EXPECT_EQ(result.exitCode, 1);
  EXPECT_THAT(result.standardError, HasSubstr("sfcbstage ended with exit status 3"));
  EXPECT_THAT(result.standardOutput, HasSubstr("from sfcbstage"));
  EXPECT_EQ(calls().size(), 1U);
}

TEST_F(RegisterCommand, SaysWhichSignalEndedATool) {
  makeAllTools();
  std::ofstream(toolFile("cimmof")) << "#!/bin/sh\nkill -TERM $$\n";
  const Result result = swinv({"register", "--for", "pegasus"});
  EXPECT_EQ(result.exitCode, 1);
  EXPECT_THAT(result.standardError, HasSubstr("cimmof was ended by signal 15"));
}

}  // namespace
