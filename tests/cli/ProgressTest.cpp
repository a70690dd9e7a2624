#include <cli/Progress.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <array>
#include <chrono>
#include <thread>

#include <fcntl.h>
#include <pty.h>
#include <unistd.h>

namespace {

/// Standard error is a terminal while this lives.
class ErrorTerminal {
 public:
  ErrorTerminal() : before_(dup(STDERR_FILENO)) {
    int slave = -1;
    if (openpty(&master_, &slave, nullptr, nullptr, nullptr) == 0) {
      dup2(slave, STDERR_FILENO);
      close(slave);
      fcntl(master_, F_SETFL, O_NONBLOCK);
    }
  }
  ~ErrorTerminal() {
    dup2(before_, STDERR_FILENO);
    close(before_);
    close(master_);
  }
  ErrorTerminal(const ErrorTerminal&) = delete;
  ErrorTerminal& operator=(const ErrorTerminal&) = delete;

  [[nodiscard]] std::string shown() const {
    std::array<char, 1024> text{};
    const ssize_t got = read(master_, text.data(), text.size());
    return {text.data(), static_cast<std::size_t>(got > 0 ? got : 0)};
  }

 private:
  int before_;
  int master_ = -1;
};

TEST(Progress, IsSilentForASecond) {
  const ErrorTerminal terminal;
  {
    cli::Progress progress("Asking");
    std::this_thread::sleep_for(std::chrono::milliseconds(50));
  }
  EXPECT_EQ(terminal.shown(), "");
}

TEST(Progress, ShowsThatItWaitsAndWipesItAway) {
  const ErrorTerminal terminal;
  cli::Progress progress("Asking");
  std::string shown;
  for (int i = 0; i < 600 && shown.find("Asking, 1 s") == std::string::npos; ++i) {
    std::this_thread::sleep_for(std::chrono::milliseconds(50));
    shown += terminal.shown();
  }
  EXPECT_THAT(shown, testing::HasSubstr("Asking, 1 s"));
  progress.stop();
  EXPECT_THAT(shown + terminal.shown(), testing::EndsWith("\r\x1b[K"));
}

}  // namespace
