// The narrow way in which the kernel tells what happens to the machine.
#pragma once

#include <chrono>
#include <memory>
#include <optional>
#include <string>

namespace agent::discovery {

struct KernelNews {
  enum class Kind {
    Object,    ///< `bytes` is a message about an object (`parseUevent`)
    HostName,  ///< the host has another name
    Lost,      ///< there were more messages than the kernel kept
  };
  Kind kind = Kind::Lost;
  std::string bytes = {};
};

/// One thread uses it; `stop` may be called from any.
class KernelChannel {
 public:
  using Time = std::chrono::steady_clock::time_point;

  KernelChannel() = default;
  KernelChannel(const KernelChannel&) = delete;
  KernelChannel& operator=(const KernelChannel&) = delete;
  virtual ~KernelChannel() = default;

  /// What happens from here on waits until it is taken. Throws `std::system_error` that names what could not
  /// be opened.
  virtual void open() = 0;

  /// Waits until there may be something to take. False where it was stopped. Throws `std::system_error`.
  virtual bool wait() = 0;

  /// Lets the time pass, whatever happens meanwhile. False where it was stopped. Needs no `open`.
  virtual bool pause(std::chrono::milliseconds time) = 0;

  /// The next of what happened; nothing where there is no more. Does not wait. Throws `std::system_error`.
  virtual std::optional<KernelNews> take() = 0;

  [[nodiscard]] virtual Time now() const = 0;

  /// Ends the wait or the pause under way, and all later ones.
  virtual void stop() noexcept = 0;
};

/// The running kernel's. Throws `std::system_error` where the process has no descriptor left.
std::unique_ptr<KernelChannel> kernelChannel();

}  // namespace agent::discovery
