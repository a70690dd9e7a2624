// The place of a SCSI device, in words that do not depend on the order in which hosts were found.
#pragma once

#include <agent/discovery/Source.h>

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <tuple>

namespace agent::discovery {

/// "HOST:CHANNEL:TARGET:LUN", as the kernel numbers a device.
struct ScsiAddress {
  std::uint32_t host = 0;
  std::uint32_t channel = 0;
  std::uint32_t target = 0;
  std::uint64_t lun = 0;

  friend bool operator<(const ScsiAddress& left, const ScsiAddress& right) {
    return std::tie(left.host, left.channel, left.target, left.lun) <
           std::tie(right.host, right.channel, right.target, right.lun);
  }
};

std::optional<ScsiAddress> parseScsiAddress(std::string_view text);

/// The folder that the SCSI host in `path` hangs below, and the name of the host ("host3"): the first folder
/// of such a name. Nothing where there is none.
struct HostPlace {
  std::string above;
  std::string name;
};
std::optional<HostPlace> hostIn(const std::string& path);

/// The place of the target of the device in `folder` (a path without links): the function of the bus that the
/// host belongs to, and what the bus behind it tells targets apart by: the ATA port, the SAS address, the
/// Fibre Channel port name; else the host's place among those of the function, the channel and the target.
std::string targetPlace(SourceContext& context, const std::string& folder, const ScsiAddress& address);

}  // namespace agent::discovery
