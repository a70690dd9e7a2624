#include <agent/discovery/events/KernelEvents.h>
#include <agent/discovery/events/Uevent.h>

#include <optional>

namespace agent::discovery {
namespace {

bool isChange(const KernelNews& news) {
  if (news.kind != KernelNews::Kind::Object) {
    return true;
  }
  const std::optional<Uevent> event = parseUevent(news.bytes);
  return event && concernsInventory(*event);
}

}  // namespace

bool KernelEvents::waitForChange() {
  if (!isOpen_) {
    return begin();
  }
  const KernelChannel::Time earliest = channel_->now() + burstTime;
  if (!channel_->wait()) {
    return false;
  }
  while (!takeChanges()) {
    // Storms of what is of no concern: once for each pause, not for each message.
    if (!channel_->pause(quietTime) || !channel_->wait()) {
      return false;
    }
  }
  const KernelChannel::Time latest = channel_->now() + burstTime;
  bool isQuiet = false;
  while (channel_->now() < latest && (!isQuiet || channel_->now() < earliest)) {
    if (!channel_->pause(quietTime)) {
      return false;
    }
    isQuiet = !takeChanges();
  }
  return true;
}

bool KernelEvents::begin() {
  if (!channel_->pause(startDelay)) {
    return false;
  }
  channel_->open();
  isOpen_ = true;
  return true;
}

/// Whether there was a change among what happened.
bool KernelEvents::takeChanges() {
  bool isChanged = false;
  for (int taken = 0; taken < mostAtOnce; ++taken) {
    const std::optional<KernelNews> news = channel_->take();
    if (!news) {
      break;
    }
    isChanged = isChange(*news) || isChanged;
  }
  return isChanged;
}

}  // namespace agent::discovery
