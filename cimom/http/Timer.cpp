#include <cimom/http/Timer.h>

#include <utility>

namespace cimom::http {

Timer::Timer() : thread_([this] { run(); }) {}

void Timer::at(Clock::time_point time, std::function<void()> work) {
  const std::lock_guard lock(mutex_);
  if (stopped_) {
    return;
  }
  const auto added = work_.emplace(time, std::move(work));
  if (added == work_.begin()) {
    changed_.notify_one();
  }
}

void Timer::stop() {
  {
    const std::lock_guard lock(mutex_);
    stopped_ = true;
    changed_.notify_one();
  }
  if (thread_.joinable()) {
    thread_.join();
  }
  const std::lock_guard lock(mutex_);
  work_.clear();
}

void Timer::run() {
  std::unique_lock lock(mutex_);
  while (!stopped_) {
    if (work_.empty()) {
      changed_.wait(lock);
    } else if (const auto next = work_.begin()->first; Clock::now() < next) {
      changed_.wait_until(lock, next);
    } else {
      const auto due = work_.extract(work_.begin());
      lock.unlock();
      due.mapped()();
      lock.lock();
    }
  }
}

}  // namespace cimom::http
