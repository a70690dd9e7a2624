// What an interface is and how it stands at the moment: its link, its speed, the address of its hardware.
#pragma once

#include <agent/discovery/Source.h>

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

namespace agent::discovery {

struct PortFacts {
  /// The address that the hardware came with: two hexadecimal digits for a byte, ":" between two.
  std::optional<std::string> permanentAddress;
  std::optional<std::string> linkTechnology;  ///< see `linkTechnology`
  std::optional<std::uint32_t> speed;         ///< of the link as it is now, in Mbit/s
  std::optional<std::string> state;           ///< see `portState`
};

/// Reads sys/class/net/NAME of an interface. A permanent address is there only where nobody set another.
PortFacts readPortFacts(SourceContext& context, const std::string& interfaceName);

/// How an interface speaks to its network, in the words of CIM's LinkTechnology ("Ethernet", "Wireless LAN",
/// "IB"), or "WWAN", which CIM has no word for. `hardwareType` is an ARPHRD_ number; `uevent` the lines of
/// the interface's uevent attribute, whose DEVTYPE tells apart what is an Ethernet to the kernel. Nothing for
/// types without a word.
std::optional<std::string> linkTechnology(std::uint32_t hardwareType, std::string_view uevent);

/// What state an interface is in: "disabled" (switched off), "up" (its link stands), "down" (switched on, but
/// no link), "testing". `flags` has the interface's IFF_ bits, `operationalState` the word of RFC 2863,
/// `carrier` whether there is a link, for drivers that leave the word at "unknown". Nothing where these say
/// nothing.
std::optional<std::string> portState(std::optional<std::uint32_t> flags, std::string_view operationalState,
                                     std::optional<bool> carrier);

/// Bytes as an address text; nothing where there are none or all are 0.
std::optional<std::string> addressText(std::string_view bytes);

}  // namespace agent::discovery
