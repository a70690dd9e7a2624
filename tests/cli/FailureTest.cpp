// How swinv fails: exit statuses, and messages that say what was wrong, where, and what to do.
#include "Process.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <array>
#include <filesystem>
#include <fstream>
#include <utility>

#include <fcntl.h>
#include <unistd.h>

namespace {

namespace fs = std::filesystem;
using cli_test::linesOf;
using cli_test::Result;
using cli_test::run;
using cli_test::swinv;
using cli_test::TemporaryFolder;
using cli_test::testFile;
using testing::AllOf;
using testing::HasSubstr;
using testing::StartsWith;

const std::string small = testFile("tests/cli/small.json");
const std::string broken = testFile("tests/cli/broken.json");

template <typename Matcher>
void expectFailure(const Result& result, int exitCode, const Matcher& message) {
  EXPECT_EQ(result.exitCode, exitCode);
  EXPECT_EQ(result.standardOutput, "");
  EXPECT_THAT(result.standardError, AllOf(StartsWith("swinv: "), message));
}

TEST(Failure, AWrongCommandLineIsTwo) {
  expectFailure(swinv({}), 2, HasSubstr("swinv --help"));
  expectFailure(swinv({"lst"}), 2, HasSubstr("did you mean 'list'?"));
  expectFailure(swinv({"list", "--format", "yaml"}), 2, HasSubstr("swinv list --help"));
  expectFailure(swinv({"list", "--inventory"}), 2, HasSubstr("--inventory"));
}

TEST(Failure, HelpAndVersionAreNone) {
  for (const char* option : {"--help", "--version"}) {
    const Result result = swinv({option});
    EXPECT_EQ(result.exitCode, 0);
    EXPECT_EQ(result.standardError, "");
    EXPECT_THAT(result.standardOutput, StartsWith("swinv "));
  }
}

TEST(Failure, WhatIsNotThereIsNotFound) {
  expectFailure(swinv({"get", "1@beef", "--inventory", small}), 1,
                AllOf(HasSubstr("CIM_ERR_NOT_FOUND"), HasSubstr("1@beef"), HasSubstr("swinv names")));
  expectFailure(swinv({"get", "26", "--inventory", small}), 1, HasSubstr("CIM_ERR_NOT_FOUND"));
  expectFailure(swinv({"get", "KELVO_SoftwareIdentity.InstanceID=\"1@beef\"", "--inventory", small}), 1,
                HasSubstr("CIM_ERR_NOT_FOUND"));
}

TEST(Failure, AnInstanceIdWithQuotesIsJustNotThere) {
  expectFailure(swinv({"get", "1@\"\\\"", "--inventory", small}), 1, HasSubstr("CIM_ERR_NOT_FOUND"));
}

TEST(Failure, KeysThatDoNotFitTheClassAreInvalid) {
  expectFailure(swinv({"get", "KELVO_SoftwareIdentity.Foo=\"1@2a\"", "--inventory", small}), 1,
                AllOf(HasSubstr("CIM_ERR_INVALID_PARAMETER"), HasSubstr("InstanceID")));
  expectFailure(swinv({"get", "KELVO_SoftwareIdentity.InstanceID=5", "--inventory", small}), 1,
                HasSubstr("CIM_ERR_INVALID_PARAMETER"));
}

TEST(Failure, UnknownClassesAndPropertiesAreNamed) {
  expectFailure(swinv({"list", "KELVO_SoftwareIdentty"}), 1,
                AllOf(HasSubstr("CIM_ERR_INVALID_CLASS"), HasSubstr("did you mean KELVO_SoftwareIdentity?")));
  expectFailure(swinv({"names", "Nonsense"}), 1,
                AllOf(HasSubstr("CIM_ERR_INVALID_CLASS"), HasSubstr("; try KELVO_"),
                      HasSubstr(", KELVO_SoftwareIdentity,")));
  expectFailure(swinv({"list", "--property", "Descripton", "--inventory", small}), 1,
                AllOf(HasSubstr("CIM_ERR_NO_SUCH_PROPERTY"), HasSubstr("did you mean Description?")));
}

TEST(Failure, ABrokenInventoryIsNamedWithLineAndField) {
  for (const std::vector<std::string>& command : std::vector<std::vector<std::string>>{
           {"list"}, {"names"}, {"get", "1@2a"}, {"tree"}, {"capture", "-"}}) {
    std::vector<std::string> arguments = command;
    arguments.insert(arguments.end(), {"--inventory", broken});
    expectFailure(swinv(arguments), 1,
                  AllOf(HasSubstr("broken.json:6"), HasSubstr("nodes[1].type"), HasSubstr("Firmwar")));
  }
  expectFailure(run({{"list"}, {{"ORU_INVENTORY", broken}}}), 1, HasSubstr("broken.json:6"));
}

TEST(Failure, AMissingMachineIsNamed) {
  for (const char* command : {"list", "names", "tree"}) {
    expectFailure(swinv({command, "--inventory", "/no/such.json"}), 1,
                  AllOf(HasSubstr("/no/such.json"), HasSubstr("No such file or directory")));
    expectFailure(swinv({command, "--system-root", "/no/such"}), 1, HasSubstr("/no/such"));
    expectFailure(swinv({command, "--system-root", small}), 1, HasSubstr("Not a directory"));
    expectFailure(swinv({command, "--inventory", "/"}), 1, HasSubstr("Is a directory"));
  }
}

TEST(Failure, AProviderThatCannotBeLoadedIsNamed) {
  expectFailure(swinv({"list", "--provider", "/no/such.so", "--inventory", small}), 1,
                HasSubstr("/no/such.so"));
  expectFailure(swinv({"list", "--provider", small, "--inventory", small}), 1,
                AllOf(HasSubstr("CIM_ERR_FAILED"), HasSubstr("small.json")));
}

/// The program alone, in a folder of its own, with what else is wanted of the installation.
class MovedProgram {
 public:
  MovedProgram() {
    fs::create_directory(folder_.at("bin"));
    fs::copy_file(SWINV_PROGRAM, program());
  }
  void link(const char* part) { fs::create_directory_symlink(original() / part, folder_.at(part)); }
  [[nodiscard]] fs::path program() const { return folder_.at("bin") / "swinv"; }
  static fs::path original() { return fs::path(SWINV_PROGRAM).parent_path().parent_path(); }

 private:
  TemporaryFolder folder_;
};

TEST(Failure, AMissingSchemaIsNamed) {
  const MovedProgram moved;
  expectFailure(run({{"list"}, {}, moved.program()}), 1,
                AllOf(HasSubstr("share/swinv/schema"), HasSubstr("install")));
}

/// An installation whose schema folder can be changed.
class MovedSchema : public MovedProgram {
 public:
  MovedSchema() {
    link("lib");
    fs::create_directories(folder());
    for (const auto& file : fs::directory_iterator(original() / "share" / "swinv" / "schema")) {
      if (file.is_regular_file()) {
        fs::copy_file(file.path(), folder() / file.path().filename());
      }
    }
  }
  [[nodiscard]] fs::path folder() const {
    return program().parent_path().parent_path() / "share" / "swinv" / "schema";
  }
  [[nodiscard]] fs::path registration() const { return folder() / "SoftwareInventoryProvider.reg"; }
  [[nodiscard]] Result list() const { return run({{"list", "--inventory", small}, {}, program()}); }
};

TEST(Failure, ASchemaWithoutRegistrationsIsNamed) {
  const MovedSchema moved;
  EXPECT_EQ(moved.list().standardOutput, swinv({"list", "--inventory", small}).standardOutput);
  const auto message =
      AllOf(HasSubstr("no provider is registered"), HasSubstr(moved.folder().string()), HasSubstr("install"));
  for (const char* file : {"SoftwareInventoryProvider.reg", "KelvoEndpointProvider.reg"}) {
    ASSERT_TRUE(fs::exists(moved.folder() / file));
    std::ofstream(moved.folder() / file, std::ios::trunc).close();
  }
  expectFailure(moved.list(), 1, message);
  fs::remove(moved.registration());
  fs::remove(moved.folder() / "KelvoEndpointProvider.reg");
  expectFailure(moved.list(), 1, message);
}

TEST(Failure, ABadRegistrationIsNamedAsOne) {
  const MovedSchema moved;
  const std::string file = moved.registration().string();
  for (const auto& [line, complaint] :
       {std::pair("nonsense", ":1: expected [CLASS]"), std::pair("[A Class]", ":1: expected the name"),
        std::pair("[X_Y]\nprovider: p\nlocation: l\ntype: instance\nnamespace: root/cimv2\n",
                  ":1: registered class X_Y is not in the schema")}) {
    std::ofstream(moved.registration(), std::ios::trunc) << line << '\n';
    expectFailure(moved.list(), 1,
                  AllOf(HasSubstr("registration"), HasSubstr(file + complaint),
                        testing::Not(HasSubstr("schema cannot be used"))));
  }
}

TEST(Failure, AMissingProviderIsNamed) {
  MovedProgram moved;
  moved.link("share");
  expectFailure(run({{"list", "--inventory", small}, {}, moved.program()}), 1,
                AllOf(HasSubstr("CIM_ERR_FAILED"), HasSubstr("libSoftwareInventoryProvider.so")));
}

TEST(Failure, AProviderElsewhereServes) {
  MovedProgram moved;
  moved.link("share");
  const std::string provider = MovedProgram::original() / "lib" / "libSoftwareInventoryProvider.so";
  const Result result = run({{"list", "--inventory", small, "--provider", provider}, {}, moved.program()});
  EXPECT_EQ(result.exitCode, 0);
  EXPECT_EQ(result.standardError, "");
  EXPECT_EQ(result.standardOutput, swinv({"list", "--inventory", small}).standardOutput);
}

TEST(Failure, TheInstalledLayoutIsFoundFromAnywhere) {
  MovedProgram moved;
  moved.link("share");
  moved.link("lib");
  const Result result = run({{"list", "--inventory", small}, {}, moved.program()});
  EXPECT_EQ(result.exitCode, 0);
  EXPECT_EQ(result.standardOutput, swinv({"list", "--inventory", small}).standardOutput);
}

TEST(Failure, AReaderThatWentAwayIsNone) {
  for (const char* format : {"table", "json", "csv"}) {
    std::array<int, 2> ends{};
    ASSERT_EQ(pipe2(ends.data(), O_CLOEXEC), 0);
    close(ends[0]);
    const Result result =
        run({{"list", "--inventory", small, "--format", format}, {}, SWINV_PROGRAM, ends[1]});
    close(ends[1]);
    EXPECT_EQ(result.exitCode, 0);
    EXPECT_EQ(result.standardError, "");
  }
}

TEST(Failure, AFullDiskIsToldOf) {
  const int full = open("/dev/full", O_WRONLY | O_CLOEXEC);
  ASSERT_GE(full, 0);
  for (const char* command : {"list", "names", "tree", "--help"}) {
    const Result result = run({{command, "--inventory", small}, {}, SWINV_PROGRAM, full});
    EXPECT_EQ(result.exitCode, 1) << command;
    EXPECT_THAT(linesOf(result.standardError), testing::ElementsAre(HasSubstr("No space left on device")));
  }
  close(full);
}

TEST(Failure, AClosedStandardOutputIsToldOf) {
  cli_test::Start start{{"list", "--inventory", small}};
  start.closeStandardOutput = true;
  expectFailure(run(start), 1, HasSubstr("cannot write to standard output"));
}

}  // namespace
