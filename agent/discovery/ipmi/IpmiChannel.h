// The way to a management controller, and the one question that is asked on it.
#pragma once

#include <chrono>
#include <cstddef>
#include <functional>
#include <memory>
#include <string>
#include <vector>

namespace agent::discovery {

/// An open way to a management controller. Used by one thread; closed when it goes.
class IpmiChannel {
 public:
  /// A request without data.
  struct Request {
    long id = 0;  ///< comes back in the answer
    unsigned char function = 0;
    unsigned char command = 0;
  };
  struct Received {
    int error = 0;          ///< an errno value; 0: a message came
    bool isAnswer = false;  ///< else it is an event, or a question of another
    long id = 0;
    unsigned char function = 0;
    unsigned char command = 0;
    std::vector<std::byte> bytes;  ///< of an answer: the completion code, then the data
  };

  IpmiChannel() = default;
  IpmiChannel(const IpmiChannel&) = delete;
  IpmiChannel& operator=(const IpmiChannel&) = delete;
  virtual ~IpmiChannel() = default;

  // Each gives 0 or an errno value.
  virtual int send(const Request& request) = 0;
  /// Waits until a message can be received; ETIMEDOUT where none comes in that time.
  virtual int awaitMessage(std::chrono::milliseconds limit) = 0;
  virtual Received receive() = 0;
};

/// A channel, or why there is none.
struct OpenedIpmi {
  std::unique_ptr<IpmiChannel> channel;
  int error = 0;  ///< an errno value
};

/// Opens a channel to the first management controller. May be called by several threads at once.
using IpmiOpener = std::function<OpenedIpmi()>;

/// The running kernel's: `ipmiDevice` and its ioctls. Needs root.
IpmiOpener kernelIpmi();
inline constexpr const char* ipmiDevice = "dev/ipmi0";

/// The answer to Get Device ID, from the completion code on.
struct DeviceIdAnswer {
  int error = 0;  ///< an errno value; ETIMEDOUT: no answer in time; EBADMSG: only messages of other kinds
  std::vector<std::byte> bytes;
};

/// Asks the controller who it is. Returns within `limit` if the channel's calls keep theirs: messages that
/// are no answer to this question do not prolong it, nor does any number of them.
DeviceIdAnswer askDeviceId(IpmiChannel& channel, std::chrono::milliseconds limit);

}  // namespace agent::discovery
