#include <cimom/http/Workers.h>

#include <system_error>
#include <thread>
#include <utility>

namespace cimom::http {
namespace {

constexpr std::chrono::seconds idleThreadStays{10};

}  // namespace

void Workers::submit(Task task) {
  std::unique_lock lock(mutex_);
  tasks_.push_back(std::move(task));
  if (idle_ >= tasks_.size()) {
    // Woken with the mutex held, the worker would go back to sleep at once.
    lock.unlock();
    work_.notify_one();
    return;
  }
  try {
    startIfNeeded();
  } catch (const std::system_error&) {
    // Those that are there do it later.
    if (threads_ == 0) {
      tasks_.pop_back();
      throw;
    }
  }
}

void Workers::startIfNeeded() {
  if (tasks_.size() > idle_ && working_ + idle_ < most_) {
    startThread();
  }
}

void Workers::startThread() {
  std::thread([this] { run(); }).detach();
  ++threads_;
  // It counts as idle until it has taken a task: whoever submits next knows that it is coming.
  ++idle_;
}

void Workers::run() {
  std::unique_lock lock(mutex_);
  for (;;) {
    const auto due = [this] { return stopped_ || (!tasks_.empty() && working_ < most_); };
    if (!due() && !work_.wait_for(lock, idleThreadStays, due) && threads_ - parked_ > kept_) {
      break;
    }
    if (!due()) {
      continue;
    }
    if (tasks_.empty()) {
      break;
    }
    Task task = std::move(tasks_.front());
    tasks_.pop_front();
    --idle_;
    ++working_;
    lock.unlock();
    task();
    task = nullptr;
    lock.lock();
    --working_;
    ++idle_;
    if (working_ + parked_ == 0) {
      ended_.notify_all();
    }
  }
  --idle_;
  --threads_;
  ended_.notify_all();
}

void Workers::park() {
  const std::lock_guard lock(mutex_);
  --working_;
  ++parked_;
  if (!tasks_.empty() && idle_ > 0) {
    work_.notify_one();
    return;
  }
  try {
    startIfNeeded();
  } catch (const std::system_error&) {
    // What waits is done when this worker, or another, has ended its task.
    return;
  }
}

void Workers::unpark() {
  const std::lock_guard lock(mutex_);
  --parked_;
  ++working_;
}

bool Workers::waitUntilIdle(std::chrono::milliseconds patience) {
  std::unique_lock lock(mutex_);
  return ended_.wait_for(lock, patience, [this] { return working_ + parked_ == 0 && tasks_.empty(); });
}

void Workers::stop() {
  std::unique_lock lock(mutex_);
  stopped_ = true;
  work_.notify_all();
  ended_.wait(lock, [this] { return threads_ == 0; });
}

}  // namespace cimom::http
