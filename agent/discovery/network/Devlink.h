// Devlink: what drivers tell of the versions of each part of a device.
#pragma once

#include <agent/discovery/network/NetlinkChannel.h>

#include <chrono>
#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace agent::discovery {

/// A version with the name that the driver's source code gives to what it is of: "fw.mgmt", "board.id". Both
/// are clean texts that say something.
struct DevlinkVersion {
  std::string name;
  std::string version;

  friend bool operator==(const DevlinkVersion&, const DevlinkVersion&) = default;
};

/// In the order of the driver; of several with one name the first.
struct DevlinkInfo {
  std::vector<DevlinkVersion> fixed;    ///< of the hardware; no update changes it
  std::vector<DevlinkVersion> running;  ///< what runs now
  std::vector<DevlinkVersion> stored;   ///< what lies in the device's memory, for its next start

  /// The texts of all running versions as they came, in the order of the driver, those that say nothing
  /// included: the kernel makes an answer to ETHTOOL_GDRVINFO of them for drivers that give none.
  std::vector<std::string> runningTexts;
};

/// Reads the attributes of an answer to DEVLINK_CMD_INFO_GET.
DevlinkInfo parseDevlinkInfo(std::string_view attributes);

/// Asks devices by devlink. Used by one thread.
class Devlink {
 public:
  struct Answer {
    int error = 0;  ///< an errno value; ENODEV: not a device of devlink; ENOENT: the kernel has no devlink;
                    ///< ETIMEDOUT: no answer in time; EBADMSG: only messages of other kinds, or a broken one
    DevlinkInfo info;
  };

  /// `limit`: how long each answer may take once the kernel has it.
  Devlink(std::unique_ptr<NetlinkChannel> channel, std::chrono::milliseconds limit);

  /// The versions of the device with that name on that bus: "pci", "0000:3b:00.0". Returns in time if the
  /// channel's calls do: messages that are no answer to this question do not prolong it, nor does any number
  /// of them.
  Answer info(std::string_view bus, std::string_view device);

 private:
  struct Reply {
    int error = 0;
    std::string attributes;
  };

  int findFamily();
  Reply ask(std::uint16_t type, std::uint32_t sequence, const std::string& request);

  std::unique_ptr<NetlinkChannel> channel_;
  std::chrono::milliseconds limit_;
  std::uint32_t sequence_ = 0;
  std::optional<std::uint16_t> family_;  ///< the number that this kernel gave to devlink
};

}  // namespace agent::discovery
