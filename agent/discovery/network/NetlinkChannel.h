// The way to the kernel's generic netlink.
#pragma once

#include <chrono>
#include <functional>
#include <memory>
#include <string>
#include <string_view>

namespace agent::discovery {

/// An open socket of generic netlink. Used by one thread; closed when it goes.
class NetlinkChannel {
 public:
  struct Received {
    int error = 0;      ///< an errno value; 0: bytes came
    std::string bytes;  ///< one or more messages
  };

  NetlinkChannel() = default;
  NetlinkChannel(const NetlinkChannel&) = delete;
  NetlinkChannel& operator=(const NetlinkChannel&) = delete;
  virtual ~NetlinkChannel() = default;

  // The first two give 0 or an errno value.
  /// Sends a request. The kernel asks the driver within this call, which therefore may hang.
  virtual int send(std::string_view request) = 0;
  /// Waits until something can be received; ETIMEDOUT where nothing comes in that time.
  virtual int await(std::chrono::milliseconds limit) = 0;
  virtual Received receive() = 0;
};

/// A channel, or why there is none.
struct OpenedNetlink {
  std::unique_ptr<NetlinkChannel> channel;
  int error = 0;  ///< an errno value
};

/// Opens a channel. May be called by several threads at once.
using NetlinkOpener = std::function<OpenedNetlink()>;

/// The running kernel's. Needs no root.
NetlinkOpener kernelNetlink();

}  // namespace agent::discovery
