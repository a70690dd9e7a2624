#include <agent/discovery/Values.h>
#include <agent/discovery/network/PortFacts.h>

#include <net/if.h>
#include <net/if_arp.h>

#include <algorithm>
#include <array>
#include <cerrno>

namespace agent::discovery {

namespace {

constexpr std::uint32_t permanentAssignment = 0;  // NET_ADDR_PERM in addr_assign_type
constexpr std::uint32_t highestSpeed = 100'000'000;

/// An attribute's text as it is. The kernel answers EINVAL where an interface that is switched off, or its
/// driver, has no value: that is an answer, and no matter for a report.
std::optional<std::string> attribute(SourceContext& context, const std::string& path) {
  context.doing(context.root().outside(path));
  Outcome<std::string> content = context.root().read(path);
  if (content) {
    return std::move(*content.value);
  }
  if (reasonOf(content.error) != SourceReport::Reason::Absent && content.error != EINVAL &&
      content.error != EOPNOTSUPP) {
    context.reportError(context.root().outside(path), content.error);
  }
  return std::nullopt;
}

std::optional<std::uint32_t> number(SourceContext& context, const std::string& path) {
  const std::optional<std::string> text = attribute(context, path);
  return text ? parseNumber(*text) : std::nullopt;
}

/// The value of a line `name`=VALUE.
std::string_view lineValue(std::string_view lines, std::string_view name) {
  while (!lines.empty()) {
    const std::string_view line = lines.substr(0, lines.find('\n'));
    if (line.starts_with(name) && line.substr(name.size()).starts_with('=')) {
      return line.substr(name.size() + 1);
    }
    lines.remove_prefix(std::min(line.size() + 1, lines.size()));
  }
  return {};
}

bool saysSomething(const std::string& address) {
  return address.find_first_not_of("0:") != std::string::npos;
}

std::optional<std::string> addressOfHardware(SourceContext& context, const std::string& folder) {
  if (number(context, folder + "/addr_assign_type") != permanentAssignment) {
    return std::nullopt;
  }
  std::optional<std::string> address = context.textIfAny(folder + "/address");
  return address && saysSomething(*address) ? address : std::nullopt;
}

/// Drivers write -1, which is no number here, or 0 for a speed that they do not know.
std::optional<std::uint32_t> speedOf(SourceContext& context, const std::string& folder) {
  const std::optional<std::uint32_t> speed = number(context, folder + "/speed");
  return speed && *speed > 0 && *speed <= highestSpeed ? speed : std::nullopt;
}

}  // namespace

std::optional<std::string> linkTechnology(std::uint32_t hardwareType, std::string_view uevent) {
  const std::string_view kind = lineValue(uevent, "DEVTYPE");
  if (kind == "wlan") {
    return "Wireless LAN";
  }
  if (kind == "bluetooth") {
    return "BlueTooth";
  }
  if (kind == "wwan") {
    return "WWAN";
  }
  switch (hardwareType) {
    case ARPHRD_ETHER:
      return "Ethernet";
    case ARPHRD_INFINIBAND:
      return "IB";
    case ARPHRD_FCPP:
    case ARPHRD_FCAL:
    case ARPHRD_FCPL:
    case ARPHRD_FCFABRIC:
      return "FC";
    case ARPHRD_FDDI:
      return "FDDI";
    case ARPHRD_ATM:
      return "ATM";
    case ARPHRD_IEEE802_TR:
      return "Token Ring";
    case ARPHRD_DLCI:
    case ARPHRD_FRAD:
      return "Frame Relay";
    case ARPHRD_IRDA:
      return "Infrared";
    case ARPHRD_IEEE80211:
    case ARPHRD_IEEE80211_PRISM:
    case ARPHRD_IEEE80211_RADIOTAP:
      return "Wireless LAN";
    default:
      return std::nullopt;
  }
}

std::optional<std::string> portState(std::optional<std::uint32_t> flags, std::string_view operationalState,
                                     std::optional<bool> carrier) {
  if (flags && (*flags & IFF_UP) == 0) {
    return "disabled";
  }
  if (operationalState == "up" || operationalState == "testing") {
    return std::string(operationalState);
  }
  for (const std::string_view word : {"down", "lowerlayerdown", "dormant", "notpresent"}) {
    if (operationalState == word) {
      return "down";
    }
  }
  return carrier ? std::optional<std::string>(*carrier ? "up" : "down") : std::nullopt;
}

std::optional<std::string> addressText(std::string_view bytes) {
  static constexpr std::string_view digits = "0123456789abcdef";
  std::string text;
  for (const char each : bytes) {
    const auto byte = static_cast<unsigned char>(each);
    text += text.empty() ? "" : ":";
    text += digits[byte >> 4U];
    text += digits[byte & 0xfU];
  }
  return saysSomething(text) ? std::optional(text) : std::nullopt;
}

PortFacts readPortFacts(SourceContext& context, const std::string& interfaceName) {
  const std::string folder = "sys/class/net/" + interfaceName;
  PortFacts facts;
  facts.permanentAddress = addressOfHardware(context, folder);
  if (const auto type = number(context, folder + "/type")) {
    facts.linkTechnology = linkTechnology(*type, attribute(context, folder + "/uevent").value_or(""));
  }
  const std::optional<std::uint32_t> carrier = number(context, folder + "/carrier");
  facts.state =
      portState(number(context, folder + "/flags"), context.textIfAny(folder + "/operstate").value_or(""),
                carrier ? std::optional(*carrier != 0) : std::nullopt);
  if (facts.state == "up") {  // some drivers go on naming the last speed of a link that is gone
    facts.speed = speedOf(context, folder);
  }
  return facts;
}

}  // namespace agent::discovery
