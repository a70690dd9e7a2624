// What stands between a provider that delivers and the pulls that take: a bounded queue of written objects.
#pragma once

#include <cimom/Outcome.h>
#include <cimom/protocol/ObjectSink.h>

#include <chrono>
#include <condition_variable>
#include <cstddef>
#include <deque>
#include <mutex>
#include <optional>
#include <string>

namespace cimom::protocol {

/// One thread delivers, one takes, any may close.
class ObjectQueue final : public ObjectSink {
 public:
  using Clock = std::chrono::steady_clock;

  enum class State {
    open,    ///< more may come
    ended,   ///< the provider has delivered everything, and it was taken
    failed,  ///< the provider has failed, and what came before was taken
    closed   ///< nothing is taken any more
  };

  explicit ObjectQueue(std::size_t bound) : bound_(bound) {}

  // --- For who delivers.
  std::string& object() override { return draft_; }
  /// Waits while the queue is full. False once it is closed.
  bool objectDone() override;
  /// To be called once, when no more comes.
  void end(Status status);

  // --- For who takes.
  /// The next object; none where there is none before `deadline`, or no more at all: `state` says which.
  [[nodiscard]] std::optional<std::string> take(Clock::time_point deadline);
  /// Waits until there is an object or the end, at most until `deadline`.
  [[nodiscard]] State state(Clock::time_point deadline);
  /// Of a provider that has failed, or of `close`.
  [[nodiscard]] Status status() const;
  /// How many objects are left; none as long as more may come.
  [[nodiscard]] std::optional<std::size_t> left() const;

  // --- For all.
  /// Ends both sides; what waits is dropped. The first status counts.
  void close(Status status);

 private:
  void waitForTaker(std::unique_lock<std::mutex>& lock, Clock::time_point deadline);

  const std::size_t bound_;
  std::string draft_;  // of who delivers
  mutable std::mutex mutex_;
  std::condition_variable changed_;
  std::deque<std::string> objects_;
  std::optional<Status> ended_;
  std::optional<Status> closed_;
};

}  // namespace cimom::protocol
