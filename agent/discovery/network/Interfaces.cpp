#include <agent/discovery/BusAddress.h>
#include <agent/discovery/Values.h>
#include <agent/discovery/network/Interfaces.h>

#include <algorithm>
#include <cerrno>
#include <tuple>
#include <utility>

namespace agent::discovery {

namespace {

constexpr std::uint32_t highestPort = 0xffff;
constexpr std::uint32_t highestIndex = 0x7fffffff;

std::optional<std::uint32_t> numberIfAny(SourceContext& context, const std::string& path,
                                         std::uint32_t limit) {
  const std::optional<std::string> text = context.textIfAny(path);
  if (!text) {
    return std::nullopt;
  }
  const std::optional<std::uint32_t> number = parseNumber(*text, limit);
  if (!number) {
    context.report(context.root().outside(path), SourceReport::Reason::Unreadable,
                   "\"" + *text + "\" is no number up to " + std::to_string(limit));
  }
  return number;
}

/// Whether the name is a representor's: the host's end of a virtual or sub-function, "pf0vf1", "c1pf0sf88".
bool isRepresentor(std::string_view physicalName) {
  if (physicalName.starts_with('c')) {
    physicalName.remove_prefix(
        std::min(physicalName.find_first_not_of("0123456789", 1), physicalName.size()));
  }
  return physicalName.starts_with("pf");
}

std::string identifier(const std::string& address, const NetworkInterface& interface) {
  std::string text = address + "/" + std::to_string(interface.port);
  if (interface.physicalName && isRepresentor(*interface.physicalName)) {
    text += "." + *interface.physicalName;
  }
  return text;
}

NetworkInterface readInterface(SourceContext& context, const std::string& name) {
  const std::string folder = "sys/class/net/" + name;
  NetworkInterface interface;
  interface.name = name;
  interface.port = portNumber(numberIfAny(context, folder + "/dev_port", highestPort),
                              numberIfAny(context, folder + "/dev_id", highestPort));
  interface.physicalName = context.textIfAny(folder + "/phys_port_name");
  interface.hardwareAddress = context.textIfAny(folder + "/address");
  interface.index = numberIfAny(context, folder + "/ifindex", highestIndex).value_or(0);
  interface.facts = readPortFacts(context, name);
  return interface;
}

}  // namespace

InterfacesByDevice findInterfaces(SourceContext& context) {
  InterfacesByDevice found;
  for (const std::string& name : context.list("sys/class/net")) {
    const std::string link = "sys/class/net/" + name + "/device";
    context.doing(context.root().outside(link));
    const Outcome<std::string> device = context.root().resolve(link);
    if (device) {
      found[functionAddress(context, *device.value)].push_back(readInterface(context, name));
    } else if (device.error != ENOENT && device.error != ENOTDIR) {
      context.reportError(context.root().outside(link), device.error);
    }
  }
  return found;
}

std::vector<std::string> sortAndIdentify(const std::string& address,
                                         std::vector<NetworkInterface>& interfaces) {
  std::sort(interfaces.begin(), interfaces.end(), [](const auto& left, const auto& right) {
    return std::tie(left.port, left.physicalName, left.hardwareAddress, left.index, left.name) <
           std::tie(right.port, right.physicalName, right.hardwareAddress, right.index, right.name);
  });
  std::vector<std::string> identifiers;
  std::map<std::string, int> taken;
  for (const NetworkInterface& interface : interfaces) {
    std::string text = identifier(address, interface);
    if (const int before = taken[text]++; before > 0) {
      text += "." + std::to_string(before + 1);
    }
    identifiers.push_back(std::move(text));
  }
  return identifiers;
}

std::uint32_t portNumber(std::optional<std::uint32_t> devPort, std::optional<std::uint32_t> devId) {
  const std::uint32_t port = devPort.value_or(0);
  return 1 + (port != 0 ? port : devId.value_or(0));
}

}  // namespace agent::discovery
