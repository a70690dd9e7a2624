// The firmware of one network device, of all that its driver and the kernel tell.
#pragma once

#include <agent/discovery/Source.h>
#include <agent/discovery/network/Devlink.h>

#include <optional>
#include <string>
#include <vector>

namespace agent::discovery {

/// What was answered about one device.
struct FirmwareAnswers {
  std::optional<std::string> driver;      ///< the firmware version of the driver info
  std::optional<std::string> infiniband;  ///< sys/class/infiniband/NAME/fw_ver
  DevlinkInfo devlink;
};

/// The firmware nodes of the device at the bus address: first that of the whole device, then its parts in the
/// order of the driver. No version stands there twice: the README has the rules.
std::vector<FoundNode> firmwareNodes(const std::string& address, const FirmwareAnswers& answers);

/// What devlink tells of a device that is no version of firmware: "board.id=K91258-000, fw.psid=MT_12".
std::optional<std::string> deviceDetails(const DevlinkInfo& info);

}  // namespace agent::discovery
