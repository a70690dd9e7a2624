#include <agent/framework/SignalsBlocked.h>
#include <agent/framework/TreeWatcher.h>

#include <exception>
#include <system_error>
#include <thread>
#include <utility>

namespace agent {

TreeWatcher::~TreeWatcher() {
  stop();
}

void TreeWatcher::start(std::unique_ptr<Events> events, Calls calls) {
  calls_ = std::move(calls);
  const std::lock_guard lock(mutex_);
  events_ = std::move(events);
  try {
    const SignalsBlocked blocked;
    std::thread([this] { run(); }).detach();
  } catch (const std::system_error& error) {
    events_.reset();
    calls_.failed(std::string("no thread could be started: ") + error.what());
  }
}

void TreeWatcher::stop() {
  std::unique_lock lock(mutex_);
  if (events_) {
    events_->stop();
  }
  ended_.wait(lock, [this] { return !events_; });
}

void TreeWatcher::run() {
  try {
    while (events_->waitForChange()) {
      calls_.look();
    }
  } catch (const std::exception& error) {
    calls_.failed(error.what());
  }
  const std::lock_guard lock(mutex_);
  events_.reset();
  ended_.notify_all();  // with the lock: without it the watcher could go in between
}

}  // namespace agent
