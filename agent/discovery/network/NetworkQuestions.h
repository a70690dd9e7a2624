// What only the running kernel can answer about network devices. Each question fills in what it is answered;
// what is not answered, and why, is reported.
#pragma once

#include <agent/discovery/network/Ethtool.h>
#include <agent/discovery/network/NetlinkChannel.h>
#include <agent/discovery/network/NetworkDevice.h>

namespace agent::discovery {

/// The driver info of all interfaces: of a device, the first that says anything tells it.
void askDrivers(SourceContext& context, Ethtool& ethtool, NetworkDevices& devices);

/// The permanent addresses that the interfaces' attributes do not tell: of the members of a bond, for
/// example, which all bear the bond's address.
void askAddresses(SourceContext& context, Ethtool& ethtool, NetworkDevices& devices);

/// Devlink's versions of all devices that are no virtual functions. After an answer that does not come in
/// time nothing more is asked.
void askDevlink(SourceContext& context, const NetlinkOpener& netlink, NetworkDevices& devices);

}  // namespace agent::discovery
