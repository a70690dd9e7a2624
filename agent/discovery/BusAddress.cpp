#include <agent/discovery/BusAddress.h>

#include <optional>

namespace agent::discovery {

namespace {

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

}  // namespace

std::string functionAddress(const SourceContext& context, const std::string& folder) {
  std::string at = folder;
  for (int depth = 0; depth < deepestDevice && !at.empty(); ++depth) {
    if (std::optional<std::string> address = addressIn(context, at)) {
      return *address;
    }
    at = parentFolder(at);
  }
  return "device:" + std::string(lastName(folder));
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
