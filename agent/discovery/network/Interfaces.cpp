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
constexpr int deepestDevice = 64;

bool isHexadecimal(std::string_view text) {
  return text.find_first_not_of("0123456789abcdef") == std::string_view::npos;
}

/// "BUS:ADDRESS" of the device in `folder`, where it is a function of a bus; nothing where it is a part of
/// one: a virtio or auxiliary device stands for (a share of) the function above it, and its own number comes
/// from the order in which drivers were bound.
std::optional<std::string> addressIn(const SourceContext& context, const std::string& folder) {
  const std::string name(lastName(folder));
  const Outcome<std::string> subsystem = context.root().linkTarget(within(folder, "subsystem"));
  if (!subsystem) {
    return isPciAddress(name) ? std::optional(name) : std::nullopt;
  }
  const std::string bus(lastName(*subsystem.value));
  const bool isClass = lastName(parentFolder(*subsystem.value)) != "bus";
  if (isClass || bus == "virtio" || bus == "auxiliary") {
    return std::nullopt;
  }
  return bus == "pci" ? name : bus + ":" + name;
}

/// The address of the nearest function of a bus at or above `device`.
std::string functionAddress(const SourceContext& context, const std::string& device) {
  std::string folder = device;
  for (int depth = 0; depth < deepestDevice && !folder.empty(); ++depth) {
    if (std::optional<std::string> address = addressIn(context, folder)) {
      return *address;
    }
    folder = parentFolder(folder);
  }
  return "device:" + std::string(lastName(device));
}

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

bool isPciAddress(std::string_view text) {
  // DDDD:BB:SS.F; domains of virtual bridges have more digits.
  const std::size_t domain = text.find(':');
  if (domain == std::string_view::npos || domain < 4 || domain > 8 ||
      !isHexadecimal(text.substr(0, domain))) {
    return false;
  }
  const std::string_view rest = text.substr(domain + 1);
  return rest.size() == 7 && rest[2] == ':' && rest[5] == '.' && isHexadecimal(rest.substr(0, 2)) &&
         isHexadecimal(rest.substr(3, 2)) && rest[6] >= '0' && rest[6] <= '7';
}

}  // namespace agent::discovery
