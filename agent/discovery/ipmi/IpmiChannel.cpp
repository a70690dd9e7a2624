#include <agent/discovery/ipmi/IpmiChannel.h>

#include <linux/ipmi_msgdefs.h>

#include <cerrno>
#include <utility>

namespace agent::discovery {

DeviceIdAnswer askDeviceId(IpmiChannel& channel, std::chrono::milliseconds limit) {
  using Clock = std::chrono::steady_clock;
  static constexpr int mostMessages = 64;  // that a channel may hold from before, events for the most part
  const Clock::time_point deadline = Clock::now() + limit;
  const IpmiChannel::Request request{1, IPMI_NETFN_APP_REQUEST, IPMI_GET_DEVICE_ID_CMD};
  if (const int error = channel.send(request)) {
    return {error, {}};
  }
  for (int i = 0; i < mostMessages; ++i) {
    const auto left = std::chrono::ceil<std::chrono::milliseconds>(deadline - Clock::now());
    if (left.count() <= 0) {
      return {ETIMEDOUT, {}};
    }
    if (const int error = channel.awaitMessage(left); error == EINTR) {
      continue;
    } else if (error != 0) {
      return {error, {}};
    }
    IpmiChannel::Received received = channel.receive();
    if (received.error == EAGAIN || received.error == EINTR) {
      continue;
    }
    if (received.error != 0) {
      return {received.error, {}};
    }
    if (received.isAnswer && received.id == request.id && received.command == request.command &&
        received.function == IPMI_NETFN_APP_RESPONSE) {
      return {0, std::move(received.bytes)};
    }
  }
  return {EBADMSG, {}};
}

}  // namespace agent::discovery
