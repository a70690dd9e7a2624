// The kernel's messages about its objects, as they come from a netlink socket.
#pragma once

#include <optional>
#include <string_view>

namespace agent::discovery {

/// One message. The views point into the parsed bytes.
struct Uevent {
  std::string_view action;      ///< "add", "remove", "move", "bind" and others
  std::string_view devicePath;  ///< the object's path below sys/: "/devices/pci0000:00/0000:00:03.0/net/eth0"
  std::string_view subsystem;   ///< "net", "module" and others; empty where the message tells none
};

/// Takes apart `ACTION@PATH`, NUL, and fields `KEY=VALUE`, each with a NUL. Nothing where the bytes are no
/// such message: the ones that udev sends to programs begin otherwise. A field that is cut short is not
/// there. No more than the first 8 KiB are looked at; the kernel writes 2 KiB and the path.
std::optional<Uevent> parseUevent(std::string_view bytes);

/// Whether the inventory may be another after this. A device got or lost its driver, or an object came, went,
/// changed or was renamed in a subsystem that the sources read. Network interfaces without a device (bridges,
/// the ends of containers) come and go by the hundred on some machines, and are never shown: they do not
/// count.
bool concernsInventory(const Uevent& event);

}  // namespace agent::discovery
