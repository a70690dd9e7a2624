// What `cmake --install` lays out: complete, found from wherever it lies, and nothing of the build tree in
// it.
#include "../cli/Process.h"
#include "CimClient.h"
#include "Served.h"
#include "tests/support/ElfFile.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>
#include <set>

namespace {

namespace fs = std::filesystem;
using cli_test::readFile;
using cli_test::Result;
using cli_test::run;
using cli_test::TemporaryFolder;
using cli_test::testFile;
using testing::AllOf;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::IsSupersetOf;
using testing::Not;
using testing::UnorderedElementsAre;

/// Installed once for all tests of this program.
class Install : public testing::Test {
 protected:
  static void SetUpTestSuite() {
    ownFolder = new TemporaryFolder;
    ownPrefix = new fs::path(ownFolder->at("opt"));
    ownResult = new Result(
        run({{"--install", SWINV_BUILD_FOLDER, "--prefix", ownPrefix->string()}, {}, CMAKE_PROGRAM}));
  }
  static void TearDownTestSuite() {
    delete ownResult;
    delete ownPrefix;
    delete ownFolder;
  }

  void SetUp() override { ASSERT_EQ(ownResult->exitCode, 0) << ownResult->standardError; }

  static fs::path at(const char* name) { return *ownPrefix / name; }

  static std::set<std::string> namesIn(const char* folder) {
    std::set<std::string> names;
    for (const fs::directory_entry& entry : fs::directory_iterator(at(folder))) {
      names.insert(entry.path().filename().string());
    }
    return names;
  }

 private:
  inline static TemporaryFolder* ownFolder = nullptr;
  inline static fs::path* ownPrefix = nullptr;
  inline static Result* ownResult = nullptr;
};

std::set<std::string> sourcesWith(const char* extension) {
  std::set<std::string> names;
  for (const fs::directory_entry& entry : fs::directory_iterator(testFile("schema"))) {
    if (entry.path().extension() == extension) {
      names.insert(entry.path().filename().string());
    }
  }
  return names;
}

TEST_F(Install, LaysOutEverythingAndNothingElse) {
  EXPECT_THAT(namesIn("."), UnorderedElementsAre("bin", "lib", "libexec", "share"));
  EXPECT_THAT(namesIn("bin"), UnorderedElementsAre("swinv"));
  EXPECT_THAT(namesIn("libexec"), UnorderedElementsAre("swinv-endpoint"));
  EXPECT_THAT(namesIn("lib"), UnorderedElementsAre("libKelvoEndpointProvider.so", "liboru.so",
                                                   "libSoftwareInventoryProvider.so", "systemd"));
  EXPECT_THAT(namesIn("lib/systemd/system"), UnorderedElementsAre("swinv.service", "swinv.socket"));
  EXPECT_THAT(namesIn("share/man/man1"), UnorderedElementsAre("swinv.1"));
  for (const char* extension : {".mof", ".reg"}) {
    EXPECT_THAT(namesIn("share/swinv/schema"), IsSupersetOf(sourcesWith(extension)));
  }
}

TEST_F(Install, LibrariesAreFoundBesideTheirUserAlone) {
  for (const char* file : {"lib/libSoftwareInventoryProvider.so", "lib/libKelvoEndpointProvider.so"}) {
    const tests::ElfFile library(at(file).string());
    EXPECT_THAT(library.runPaths(), ElementsAre("$ORIGIN")) << file;
    EXPECT_THAT(library.neededLibraries(), testing::Contains("liboru.so")) << file;
  }
  EXPECT_THAT(tests::ElfFile(at("lib/liboru.so").string()).runPaths(), ElementsAre("$ORIGIN"));
  for (const char* program : {"bin/swinv", "libexec/swinv-endpoint"}) {
    for (const std::string& path : tests::ElfFile(at(program).string()).runPaths()) {
      EXPECT_THAT(path, testing::StartsWith("$ORIGIN")) << program;
    }
  }
}

// What serves brings libraries that take longer to load than most inventories take to print.
TEST_F(Install, SwinvItselfLoadsNoServer) {
  for (const std::string& library : tests::ElfFile(at("bin/swinv").string()).neededLibraries()) {
    EXPECT_THAT(library, testing::MatchesRegex(
                             "lib(stdc..|m|gcc_s|c)[.]so[.].*|ld-linux.*|libasan.*|libubsan.*|libtsan.*"));
  }
}

TEST_F(Install, NothingNamesTheBuildTree) {
  for (const fs::directory_entry& entry : fs::recursive_directory_iterator(at("."))) {
    const std::string extension = entry.path().extension().string();
    if (entry.is_regular_file() && extension != ".so" && entry.path().filename() != "swinv" &&
        entry.path().filename() != "swinv-endpoint") {
      EXPECT_THAT(readFile(entry.path()), Not(HasSubstr(SWINV_BUILD_FOLDER))) << entry.path();
      EXPECT_THAT(readFile(entry.path()), AllOf(Not(IsEmpty()), Not(HasSubstr("@CMAKE")))) << entry.path();
    }
  }
}

TEST_F(Install, TheServiceStartsWhatWasInstalled) {
  const std::string unit = readFile(at("lib/systemd/system/swinv.service"));
  EXPECT_THAT(unit, HasSubstr("\nExecStart=" + at("bin/swinv").string() + " serve $SERVE_OPTIONS\n"));
  EXPECT_THAT(unit, HasSubstr("\nType=notify\n"));
  EXPECT_THAT(unit, HasSubstr("\nExecReload=/bin/kill -HUP $MAINPID\n"));
  // Each of these would hide from discovery what it reads.
  for (const char* blindfold : {"\nProtectKernelModules=", "\nProtectHostname=", "\nPrivateDevices=",
                                "\nPrivateNetwork=", "\nPrivateUsers=", "\nProcSubset="}) {
    EXPECT_THAT(unit, Not(HasSubstr(blindfold)));
  }
  EXPECT_THAT(readFile(at("lib/systemd/system/swinv.socket")),
              AllOf(HasSubstr("\nListenStream=127.0.0.1:5988\n"), HasSubstr("\nFileDescriptorName=http\n")));
}

TEST_F(Install, RunsFromWhereItLiesAndFromWhereItWasMoved) {
  const std::vector<std::string> list{"list",       "--inventory", testFile("examples/server.json"),
                                      "--property", "Description", "--format",
                                      "csv"};
  const fs::path moved = at("..") / "moved";
  fs::copy(at("."), moved, fs::copy_options::recursive);
  for (const fs::path& prefix : {at("."), moved}) {
    const Result result = run({list, {}, prefix / "bin" / "swinv"});
    EXPECT_EQ(result.exitCode, 0) << result.standardError;
    EXPECT_THAT(result.standardOutput, AllOf(HasSubstr("BMC Firmware"), HasSubstr("velmor25 driver")));
  }
  serve_test::ServeStart start;
  start.program = moved / "bin" / "swinv";
  serve_test::Served served(start);
  EXPECT_EQ(serve_test::CimClient(served.port()).countIdentities(), 19U);
  EXPECT_EQ(served.end(), 0) << served.log();
  // What is missing is missed, and not taken from the build tree.
  fs::remove(moved / "lib" / "liboru.so");
  EXPECT_EQ(run({list, {}, moved / "bin" / "swinv"}).exitCode, 1);
}

}  // namespace
