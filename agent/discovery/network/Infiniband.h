// InfiniBand adapters, as the kernel lists them.
#pragma once

#include <agent/discovery/Source.h>
#include <agent/discovery/network/Interfaces.h>

#include <map>
#include <optional>
#include <string>
#include <string_view>

namespace agent::discovery {

struct InfinibandAdapter {
  std::optional<std::string> firmware;  ///< sys/class/infiniband/NAME/fw_ver
  /// Its own ports; `hasInterface` is false for each. Described by the kernel's names of adapter and port:
  /// "hca0/1".
  std::vector<NetworkInterface> ports;
};

/// By the bus address of the function. Adapters that are made of software have none, and are left out; of
/// several adapters on a function the first with firmware tells it.
std::map<std::string, InfinibandAdapter> findInfiniband(SourceContext& context);

/// The state of a port: "4: ACTIVE" is "up", another logical state is "down". Nothing for other texts.
std::optional<std::string> infinibandPortState(std::string_view text);

}  // namespace agent::discovery
