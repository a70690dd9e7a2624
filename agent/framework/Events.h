// Tells when the machine changes.
#pragma once

namespace agent {

/// What happens to the machine, as reasons to look at it again. One thread waits; `stop` may be called from
/// any.
class Events {
 public:
  Events() = default;
  Events(const Events&) = delete;
  Events& operator=(const Events&) = delete;
  virtual ~Events() = default;

  /// Waits until the machine changed, or may have, since the last call returned. Many changes at once are
  /// one, and calls return so seldom that each may be answered by a look at the whole machine. False where
  /// `stop` was called. Throws `std::exception` with the reason where changes cannot be followed, or not any
  /// more; then there is no further call.
  virtual bool waitForChange() = 0;

  /// Ends the call under way, and all later ones.
  virtual void stop() noexcept = 0;
};

}  // namespace agent
