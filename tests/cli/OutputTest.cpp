#include "CapturedOutput.h"

#include <cli/FileWriter.h>
#include <cli/Messages.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cerrno>
#include <csignal>
#include <filesystem>
#include <fstream>
#include <sstream>

#include <fcntl.h>

namespace {

namespace fs = std::filesystem;
using testing::HasSubstr;

TEST(Output, AFullDiskIsSeen) {
  const int full = open("/dev/full", O_WRONLY | O_CLOEXEC);
  ASSERT_GE(full, 0);
  cli::Output output(full);
  output.write("text");
  EXPECT_EQ(output.error(), 0);
  output.flush();
  EXPECT_EQ(output.error(), ENOSPC);
  close(full);
}

TEST(Output, AReaderThatIsGoneIsSeenWhileMoreIsWritten) {
  std::array<int, 2> ends{};
  ASSERT_EQ(pipe2(ends.data(), O_CLOEXEC), 0);
  close(ends[0]);
  const auto before = std::signal(SIGPIPE, SIG_IGN);
  cli::Output output(ends[1]);
  output.write(std::string(1 << 20, 'x'));
  EXPECT_EQ(output.error(), EPIPE);
  static_cast<void>(std::signal(SIGPIPE, before));
  close(ends[1]);
}

TEST(Output, LargeTextsComeThroughWhole) {
  cli_test::CapturedOutput captured;
  std::string expected;
  for (int i = 0; i < 50000; ++i) {
    const std::string line = std::to_string(i) + "\n";
    captured.output().write(line);
    expected += line;
  }
  EXPECT_EQ(captured.text(), expected);
}

class FileWriterTest : public testing::Test {
 protected:
  FileWriterTest() : folder_(fs::path(testing::TempDir()) / ("swinv-" + std::to_string(getpid()))) {
    fs::create_directory(folder_);
  }
  ~FileWriterTest() override {
    std::error_code ignored;
    fs::remove_all(folder_, ignored);
  }
  [[nodiscard]] fs::path at(const char* name) const { return folder_ / name; }
  static std::string content(const fs::path& file) {
    std::stringstream text;
    text << std::ifstream(file).rdbuf();
    return text.str();
  }
  static std::string failure(const fs::path& file, bool replace) {
    try {
      cli::writeWhole(file, "new", replace);
    } catch (const cli::CommandError& error) {
      return error.what();
    }
    return "no error";
  }
  [[nodiscard]] std::ptrdiff_t entries() const {
    return std::distance(fs::directory_iterator(folder_), fs::directory_iterator());
  }

 private:
  fs::path folder_;
};

TEST_F(FileWriterTest, WritesANewFileAndLeavesNothingBeside) {
  cli::writeWhole(at("f"), "text", false);
  EXPECT_EQ(content(at("f")), "text");
  EXPECT_EQ(entries(), 1);
}

TEST_F(FileWriterTest, AnExistingFileIsReplacedOnlyWhenAsked) {
  cli::writeWhole(at("f"), "old", false);
  EXPECT_THAT(failure(at("f"), false), HasSubstr("--force"));
  EXPECT_EQ(content(at("f")), "old");
  cli::writeWhole(at("f"), "new", true);
  EXPECT_EQ(content(at("f")), "new");
  EXPECT_EQ(entries(), 1);
}

TEST_F(FileWriterTest, ALinkStaysOne) {
  cli::writeWhole(at("target"), "old", false);
  fs::create_symlink(at("target"), at("link"));
  EXPECT_THAT(failure(at("link"), false), HasSubstr("--force"));
  cli::writeWhole(at("link"), "new", true);
  EXPECT_TRUE(fs::is_symlink(at("link")));
  EXPECT_EQ(content(at("target")), "new");
}

TEST_F(FileWriterTest, ADanglingLinkIsLeftAlone) {
  fs::create_symlink(at("nowhere"), at("link"));
  EXPECT_THAT(failure(at("link"), false), HasSubstr("exists"));
  EXPECT_TRUE(fs::is_symlink(at("link")));
  EXPECT_EQ(entries(), 1);
}

TEST_F(FileWriterTest, DevicesAndFoldersAreNeverReplaced) {
  EXPECT_THAT(failure("/dev/null", true), HasSubstr("no regular file"));
  EXPECT_THAT(failure(at("."), true), HasSubstr("no regular file"));
}

TEST_F(FileWriterTest, AFolderThatIsMissingIsNamed) {
  EXPECT_THAT(failure(at("missing/f"), false),
              testing::AllOf(HasSubstr("missing/f"), HasSubstr("No such file")));
}

}  // namespace
