// A sign of life on a terminal while a request takes long.
#pragma once

#include <condition_variable>
#include <mutex>
#include <string>
#include <thread>

namespace cli {

/// After one second, and once a second from then on, prints on standard error what is being waited for;
/// `stop` and the destructor wipe it away. Does nothing where standard error is no terminal.
///
/// Threads: made and stopped by one thread; has one of its own, which touches nothing but the terminal.
class Progress {
 public:
  explicit Progress(std::string what);
  ~Progress();
  Progress(const Progress&) = delete;
  Progress& operator=(const Progress&) = delete;

  /// Returns when nothing more is printed. Further calls do nothing.
  void stop();

 private:
  void run();

  std::string what_;
  std::mutex mutex_;
  std::condition_variable changed_;
  bool stopping_ = false;
  std::thread thread_;
};

}  // namespace cli
