#include <cimom/protocol/ObjectQueue.h>

#include <algorithm>
#include <utility>

namespace cimom::protocol {

bool ObjectQueue::objectDone() {
  std::unique_lock lock(mutex_);
  changed_.wait(lock, [this] { return closed_ || objects_.size() < std::max<std::size_t>(bound_, 1); });
  if (!closed_)
    objects_.push_back(std::exchange(draft_, {}));
  changed_.notify_all();
  return !closed_;
}

void ObjectQueue::end(Status status) {
  const std::scoped_lock lock(mutex_);
  ended_ = std::move(status);
  changed_.notify_all();
}

void ObjectQueue::waitForTaker(std::unique_lock<std::mutex>& lock, Clock::time_point deadline) {
  changed_.wait_until(lock, deadline, [this] { return closed_ || ended_ || !objects_.empty(); });
}

std::optional<std::string> ObjectQueue::take(Clock::time_point deadline) {
  std::unique_lock lock(mutex_);
  waitForTaker(lock, deadline);
  if (closed_ || objects_.empty())
    return std::nullopt;
  std::string object = std::move(objects_.front());
  objects_.pop_front();
  changed_.notify_all();
  return object;
}

ObjectQueue::State ObjectQueue::state(Clock::time_point deadline) {
  std::unique_lock lock(mutex_);
  waitForTaker(lock, deadline);
  if (closed_)
    return State::closed;
  if (!ended_ || !objects_.empty())
    return State::open;
  return ended_->code == CMPI_RC_OK ? State::ended : State::failed;
}

Status ObjectQueue::status() const {
  const std::scoped_lock lock(mutex_);
  return closed_ ? *closed_ : ended_.value_or(Status{});
}

std::optional<std::size_t> ObjectQueue::left() const {
  const std::scoped_lock lock(mutex_);
  return ended_ ? std::optional(objects_.size()) : std::nullopt;
}

void ObjectQueue::close(Status status) {
  const std::scoped_lock lock(mutex_);
  if (!closed_)
    closed_ = std::move(status);
  objects_.clear();
  changed_.notify_all();
}

}  // namespace cimom::protocol
