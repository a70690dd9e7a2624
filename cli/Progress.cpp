#include <cli/Output.h>
#include <cli/Progress.h>

#include <chrono>
#include <utility>

#include <unistd.h>

namespace cli {
namespace {

void toTerminal(std::string_view text) {
  Output error(STDERR_FILENO);
  error.write(text);
  error.flush();
}

}  // namespace

Progress::Progress(std::string what) : what_(std::move(what)) {
  if (isatty(STDERR_FILENO) == 1) {
    thread_ = std::thread(&Progress::run, this);
  }
}

Progress::~Progress() {
  stop();
}

void Progress::stop() {
  if (!thread_.joinable()) {
    return;
  }
  {
    const std::lock_guard lock(mutex_);
    stopping_ = true;
  }
  changed_.notify_one();
  thread_.join();
}

void Progress::run() {
  using std::chrono::seconds;
  using std::chrono::steady_clock;
  std::unique_lock lock(mutex_);
  int elapsed = 0;
  const steady_clock::time_point start = steady_clock::now();
  while (!changed_.wait_until(lock, start + seconds(elapsed + 1), [this] { return stopping_; })) {
    ++elapsed;
    toTerminal("\r" + what_ + ", " + std::to_string(elapsed) + " s\x1b[K");
  }
  if (elapsed > 0) {
    toTerminal("\r\x1b[K");
  }
}

}  // namespace cli
