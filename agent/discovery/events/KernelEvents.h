// What the kernel tells, as reasons to look at the machine again.
#pragma once

#include <agent/discovery/events/KernelChannel.h>
#include <agent/framework/Events.h>

#include <chrono>
#include <memory>
#include <utility>

namespace agent::discovery {

/// Leaves out what does not concern the inventory, and makes one change of a burst.
class KernelEvents : public Events {
 public:
  using Milliseconds = std::chrono::milliseconds;

  /// How long the kernel is not asked at first. Programs that end before have no use for events.
  static constexpr Milliseconds startDelay{1000};
  /// A burst is over when nothing happened for so long.
  static constexpr Milliseconds quietTime{200};
  /// The time from the first event of a burst to the change, at most; and that from the end of a look to the
  /// next, at least.
  static constexpr Milliseconds burstTime{1000};
  /// So many messages are taken in one go, however many there are. In a storm the kernel's queue overflows,
  /// which costs nothing and is a change by itself.
  static constexpr int mostAtOnce = 256;

  explicit KernelEvents(std::unique_ptr<KernelChannel> channel) : channel_(std::move(channel)) {}

  /// The first call returns as soon as events are followed: what happened before is not known.
  bool waitForChange() override;
  void stop() noexcept override { channel_->stop(); }

 private:
  bool begin();
  bool takeChanges();

  std::unique_ptr<KernelChannel> channel_;
  bool isOpen_ = false;
};

}  // namespace agent::discovery
