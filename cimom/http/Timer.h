// Work that is done at a time, on a thread of its own.
#pragma once

#include <chrono>
#include <condition_variable>
#include <functional>
#include <map>
#include <mutex>
#include <thread>

namespace cimom::http {

using Clock = std::chrono::steady_clock;

/// Its work must be short, must not throw, and may ask for more work.
class Timer {
 public:
  Timer();
  ~Timer() { stop(); }
  Timer(const Timer&) = delete;
  Timer& operator=(const Timer&) = delete;

  /// Any thread. After `stop` nothing is done.
  void at(Clock::time_point time, std::function<void()> work);

  /// Waits for what is being done, and drops the rest.
  void stop();

 private:
  void run();

  std::mutex mutex_;
  std::condition_variable changed_;
  std::multimap<Clock::time_point, std::function<void()>> work_;
  bool stopped_ = false;
  std::thread thread_;
};

}  // namespace cimom::http
