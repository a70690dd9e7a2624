// swinv passwd: from a pipe, and from a terminal.
#include "Secrets.h"

#include <cimom/http/Passwords.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <array>
#include <chrono>
#include <stdexcept>

#include <poll.h>
#include <pty.h>
#include <sys/mman.h>
#include <termios.h>
#include <unistd.h>

namespace {

using cimom::http::Passwords;
using cli_test::readFile;
using cli_test::Result;
using cli_test::TemporaryFolder;
using serve_test::Secrets;
using testing::AllOf;
using testing::HasSubstr;
using testing::Not;

class Passwd : public testing::Test {
 protected:
  [[nodiscard]] bool lets(const char* user, const char* password) const {
    return Passwords::read(file).verify(user, password);
  }

  TemporaryFolder folder;
  std::string file = folder.at("passwords").string();
};

TEST_F(Passwd, AddsAUserThenChangesThePassword) {
  const Result added = Secrets::setPassword(file, "ada", "analytical");
  EXPECT_EQ(added.exitCode, 0) << added.standardError;
  EXPECT_EQ(added.standardOutput, "Added ada to " + file + "\n");
  EXPECT_TRUE(lets("ada", "analytical"));
  EXPECT_THAT(readFile(file), Not(HasSubstr("analytical")));
  const auto permissions = std::filesystem::status(file).permissions();
  EXPECT_EQ(permissions & std::filesystem::perms::group_all, std::filesystem::perms::none);
  EXPECT_EQ(permissions & std::filesystem::perms::others_all, std::filesystem::perms::none);

  const Result changed = Secrets::setPassword(file, "ada", "difference engine");
  EXPECT_EQ(changed.standardOutput, "Changed the password of ada in " + file + "\n");
  EXPECT_TRUE(lets("ada", "difference engine"));
  EXPECT_FALSE(lets("ada", "analytical"));
}

TEST_F(Passwd, TakesAUserOut) {
  Secrets::setPassword(file, "ada", "a");
  Secrets::setPassword(file, "bob", "b");
  EXPECT_EQ(cli_test::swinv({"passwd", file, "ada", "--delete"}).standardOutput,
            "Removed ada from " + file + "\n");
  EXPECT_FALSE(lets("ada", "a"));
  EXPECT_TRUE(lets("bob", "b"));
  const Result again = cli_test::swinv({"passwd", file, "ada", "--delete"});
  EXPECT_EQ(again.exitCode, 1);
  EXPECT_THAT(again.standardError, HasSubstr("there is no user 'ada'"));
}

TEST_F(Passwd, RefusesWhatIsNoPasswordOrNoUser) {
  const Result empty = Secrets::setPassword(file, "ada", "");
  EXPECT_EQ(empty.exitCode, 1);
  EXPECT_THAT(empty.standardError, HasSubstr("the password is empty"));
  EXPECT_EQ(Secrets::setPassword(file, "ada", std::string(600, 'x')).exitCode, 1);
  EXPECT_EQ(Secrets::setPassword(file, "a:b", "x").exitCode, 1);
  EXPECT_EQ(folder.entries(), 0U) << "no file was made";
  EXPECT_EQ(Secrets::setPassword(folder.at("none").string() + "/passwords", "ada", "x").exitCode, 1);
}

/// swinv passwd with a terminal as standard input.
class PasswdOnTerminal {
 public:
  PasswdOnTerminal(const std::string& file, const char* user) : error_(memfd_create("stderr", MFD_CLOEXEC)) {
    int slave = -1;
    if (openpty(&master_, &slave, nullptr, nullptr, nullptr) != 0) {
      throw std::runtime_error("no pseudo terminal");
    }
    const std::string command = "exec <&" + std::to_string(slave) + "; exec \"$0\" passwd \"$1\" \"$2\"";
    process_ = cli_test::spawn({{"-c", command, SWINV_PROGRAM, file, user}, {}, "/bin/sh"}, slave, error_);
    slave_ = slave;
  }
  ~PasswdOnTerminal() {
    close(master_);
    close(slave_);
    close(error_);
  }
  PasswdOnTerminal(const PasswdOnTerminal&) = delete;
  PasswdOnTerminal& operator=(const PasswdOnTerminal&) = delete;

  /// Types a line once the question was asked, which switches the echo off.
  void answer(const std::string& question, const std::string& line) const {
    const auto end = std::chrono::steady_clock::now() + std::chrono::minutes(1);
    while (messages().find(question) == std::string::npos || echoes()) {
      if (std::chrono::steady_clock::now() > end) {
        throw std::runtime_error("it does not ask: " + messages());
      }
      usleep(1000);
    }
    const std::string typed = line + "\n";
    if (write(master_, typed.data(), typed.size()) < 0) {
      throw std::runtime_error("the terminal is gone");
    }
  }

  int wait() const { return cli_test::exitCodeOf(process_); }

  [[nodiscard]] bool echoes() const {
    termios settings{};
    tcgetattr(slave_, &settings);
    return (settings.c_lflag & ECHO) != 0;
  }

  [[nodiscard]] std::string messages() const {
    std::array<char, 4096> bytes{};
    const ssize_t got = pread(error_, bytes.data(), bytes.size(), 0);
    return {bytes.data(), got > 0 ? static_cast<std::size_t>(got) : 0};
  }

  /// What the terminal shows.
  [[nodiscard]] std::string shown() const {
    std::string text;
    pollfd ready{master_, POLLIN, 0};
    std::array<char, 4096> bytes{};
    while (poll(&ready, 1, 100) == 1) {
      const ssize_t got = read(master_, bytes.data(), bytes.size());
      if (got <= 0) {
        break;
      }
      text.append(bytes.data(), static_cast<std::size_t>(got));
    }
    return text;
  }

 private:
  int master_ = -1;
  int slave_ = -1;
  int error_;
  int process_ = -1;
};

TEST_F(Passwd, AsksTwiceOnATerminalWithoutEcho) {
  const PasswdOnTerminal terminal(file, "ada");
  terminal.answer("New password of ada: ", "analytical");
  terminal.answer("Once more: ", "analytical");
  EXPECT_EQ(terminal.wait(), 0) << terminal.messages();
  EXPECT_TRUE(lets("ada", "analytical"));
  EXPECT_TRUE(terminal.echoes()) << "as before";
  EXPECT_THAT(terminal.shown(), AllOf(Not(HasSubstr("analytical")), HasSubstr("Added ada")));
}

TEST_F(Passwd, ChangesNothingWhereTheTwoDifferOrSomebodyGivesUp) {
  const PasswdOnTerminal differing(file, "ada");
  differing.answer("New password of ada: ", "analytical");
  differing.answer("Once more: ", "analytic");
  EXPECT_EQ(differing.wait(), 1);
  EXPECT_THAT(differing.messages(), HasSubstr("the passwords differ; nothing was changed"));

  const PasswdOnTerminal interrupted(file, "ada");
  interrupted.answer("New password of ada: ", "analy\x03");
  EXPECT_EQ(interrupted.wait(), 1);
  EXPECT_TRUE(interrupted.echoes());
  EXPECT_EQ(folder.entries(), 0U);
}

}  // namespace
