// Network devices with their firmware and their ports.
#pragma once

#include <agent/discovery/Source.h>
#include <agent/discovery/network/Ethtool.h>
#include <agent/discovery/network/NetlinkChannel.h>

#include <memory>

namespace agent::discovery {

/// Finds network devices: a node for each function of a bus that has interfaces or InfiniBand ports, with the
/// firmware that its driver and the kernel tell of (where they tell of any) and its ports. Devices with both
/// come first, then by bus address. Without `ethtool` drivers are not asked for their info, without `netlink`
/// not by devlink.
void readNetwork(SourceContext& context, const std::shared_ptr<Ethtool>& ethtool,
                 const NetlinkOpener& netlink);

}  // namespace agent::discovery
