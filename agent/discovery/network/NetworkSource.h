// Network devices with their firmware and their ports.
#pragma once

#include <agent/discovery/Source.h>
#include <agent/discovery/network/Ethtool.h>

#include <memory>

namespace agent::discovery {

/// Finds network devices: a node for each function of a bus that has interfaces, with the firmware that its
/// driver tells of (where it tells of one) and a port for each interface. Devices with both come first, then
/// by bus address. Without `ethtool` drivers are not asked.
void readNetwork(SourceContext& context, const std::shared_ptr<Ethtool>& ethtool);

}  // namespace agent::discovery
