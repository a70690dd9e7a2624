// How a test steers the provider of the crowd, which is loaded as any other is.
#pragma once

#include <condition_variable>
#include <cstddef>
#include <limits>
#include <mutex>

namespace protocol_test {

/// The crowd has `size` objects, of which `allowed` may be delivered by now. `failsAfter` of them it fails.
struct Control {
  static constexpr std::size_t all = std::numeric_limits<std::size_t>::max();

  std::mutex mutex;
  std::condition_variable changed;
  std::size_t size = 3;
  std::size_t allowed = all;
  std::size_t failsAfter = all;
  std::size_t delivered = 0;  ///< since the last enumeration began
  std::size_t running = 0;    ///< enumerations that have not returned

  void set(std::size_t Control::*member, std::size_t value) {
    const std::scoped_lock lock(mutex);
    this->*member = value;
    changed.notify_all();
  }
  [[nodiscard]] std::size_t get(std::size_t Control::*member) {
    const std::scoped_lock lock(mutex);
    return this->*member;
  }
};

/// The name of the function that returns it.
inline constexpr const char* controlFunction = "ProtocolTestControl";
using ControlFunction = Control* (*)();

}  // namespace protocol_test
