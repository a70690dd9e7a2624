// What is known of a network device.
#pragma once

#include <agent/discovery/network/Interfaces.h>
#include <agent/discovery/network/NetworkFirmware.h>

#include <map>
#include <optional>
#include <string>
#include <vector>

namespace agent::discovery {

struct NetworkDevice {
  std::vector<NetworkInterface> interfaces;  ///< at least one
  /// A virtual function runs no firmware of its own: what its driver tells is the physical function's.
  bool isVirtualFunction = false;
  std::optional<std::string> driverVersion;
  FirmwareAnswers firmware;
};

/// By bus address, as `InterfacesByDevice`.
using NetworkDevices = std::map<std::string, NetworkDevice>;

}  // namespace agent::discovery
