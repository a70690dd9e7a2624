// The network interfaces of devices, and the place of each: which function of which bus, and which port of
// it.
#pragma once

#include <agent/discovery/Source.h>
#include <agent/discovery/network/PortFacts.h>

#include <cstdint>
#include <map>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace agent::discovery {

/// One interface of a network device.
struct NetworkInterface {
  std::string name;          ///< the interface's present name, for people
  bool hasInterface = true;  ///< false: a port that has no interface now, which nothing can be asked about
  std::uint32_t port = 1;    ///< its port of the device, counted from 1
  /// sys/class/net/NAME/phys_port_name, where the driver gives one: "p0", "pf0vf1".
  std::optional<std::string> physicalName;
  /// sys/class/net/NAME/address: "02:00:5e:10:00:01".
  std::optional<std::string> hardwareAddress;
  std::uint32_t index = 0;  ///< the kernel's number of the interface, in the order of making
  PortFacts facts;
};

/// By the bus address of the device: "0000:3b:00.0" on PCI, "BUS:ADDRESS" elsewhere, such as "usb:1-1.4:1.0".
using InterfacesByDevice = std::map<std::string, std::vector<NetworkInterface>>;

/// Finds the interfaces that have a device: those with a `device` link. Bridges, VLANs, bonds and the
/// loopback have none.
InterfacesByDevice findInterfaces(SourceContext& context);

/// The port identifiers of one device's interfaces, in the order in which they are sorted here: by port. An
/// identifier is unique in the machine and knows no interface name: the bus address, "/", the port.
/// Interfaces that stand for a virtual function at the same port ("pf0vf1") bear that too; what shares a port
/// with others beyond that is told apart by the order of the hardware addresses, and what shares even that by
/// the order in which the kernel made it.
std::vector<std::string> sortAndIdentify(const std::string& address,
                                         std::vector<NetworkInterface>& interfaces);

/// The number of a port, from 1: `dev_port` counts from 0; drivers from before that attribute count in
/// `dev_id`.
std::uint32_t portNumber(std::optional<std::uint32_t> devPort, std::optional<std::uint32_t> devId);

}  // namespace agent::discovery
