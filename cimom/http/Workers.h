// Threads that handle requests: as many as there is work for, within bounds.
#pragma once

#include <chrono>
#include <condition_variable>
#include <cstddef>
#include <deque>
#include <functional>
#include <mutex>

namespace cimom::http {

/// A worker that waits for its client is parked: it does not count as working, and another takes its place.
class Workers {
 public:
  using Task = std::function<void()>;

  /// At most `most` work at once; `kept` threads stay when there is nothing to do, others leave after a
  /// while.
  Workers(std::size_t kept, std::size_t most) : kept_(kept), most_(most) {}

  /// Waits for what is being done and was submitted.
  ~Workers() { stop(); }
  Workers(const Workers&) = delete;
  Workers& operator=(const Workers&) = delete;

  /// Hands a task to a worker; it must not throw. Without threads of the system, and with no worker that
  /// could take it later, it throws std::system_error.
  void submit(Task task);

  /// Called by the worker itself, before and after it waits.
  void park();
  void unpark();

  /// Waits at most so long until nothing is being done. True: nothing is.
  bool waitUntilIdle(std::chrono::milliseconds patience);

  /// Waits for what is being done and was submitted, and ends the threads.
  void stop();

 private:
  void startThread();
  void startIfNeeded();
  void run();

  const std::size_t kept_;
  const std::size_t most_;
  std::mutex mutex_;
  std::condition_variable work_;
  std::condition_variable ended_;
  std::deque<Task> tasks_;
  std::size_t threads_ = 0;
  std::size_t idle_ = 0;
  std::size_t working_ = 0;
  std::size_t parked_ = 0;
  bool stopped_ = false;
};

}  // namespace cimom::http
