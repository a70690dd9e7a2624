#include <agent/discovery/BusAddress.h>
#include <agent/discovery/Values.h>
#include <agent/discovery/network/Infiniband.h>

#include <cerrno>
#include <iterator>
#include <utility>

namespace agent::discovery {

namespace {

constexpr std::uint32_t highestPort = 255;

/// The words of CIM's LinkTechnology for the two that the kernel has.
std::optional<std::string> linkLayer(std::string_view text) {
  if (text == "InfiniBand") {
    return "IB";
  }
  return text == "Ethernet" ? std::optional<std::string>(text) : std::nullopt;
}

std::vector<NetworkInterface> readPorts(SourceContext& context, const std::string& adapter) {
  const std::string folder = "sys/class/infiniband/" + adapter + "/ports";
  std::vector<NetworkInterface> ports;
  for (const std::string& name : context.listIfAny(folder)) {
    const std::optional<std::uint32_t> number = parseNumber(name, highestPort);
    if (!number || *number == 0) {
      continue;
    }
    NetworkInterface port;
    port.name = within(adapter, name);
    port.hasInterface = false;
    port.port = *number;
    const std::string path = within(folder, name);
    port.facts.linkTechnology = linkLayer(context.textIfAny(path + "/link_layer").value_or(""));
    port.facts.state = infinibandPortState(context.textIfAny(path + "/state").value_or(""));
    ports.push_back(std::move(port));
  }
  return ports;
}

}  // namespace

std::map<std::string, InfinibandAdapter> findInfiniband(SourceContext& context) {
  std::map<std::string, InfinibandAdapter> found;
  for (const std::string& name : context.listIfAny("sys/class/infiniband")) {
    const std::string folder = "sys/class/infiniband/" + name;
    const Outcome<std::string> device = context.root().resolve(folder + "/device");
    if (!device) {
      if (device.error != ENOENT && device.error != ENOTDIR) {
        context.reportError(context.root().outside(folder + "/device"), device.error);
      }
      continue;
    }
    InfinibandAdapter& adapter = found[functionAddress(context, *device.value)];
    if (!adapter.firmware) {
      adapter.firmware = context.textIfAny(folder + "/fw_ver");
    }
    std::vector<NetworkInterface> ports = readPorts(context, name);
    adapter.ports.insert(adapter.ports.end(), std::make_move_iterator(ports.begin()),
                         std::make_move_iterator(ports.end()));
  }
  return found;
}

std::optional<std::string> infinibandPortState(std::string_view text) {
  const std::size_t colon = text.find(": ");
  if (colon == std::string_view::npos) {
    return std::nullopt;
  }
  const std::string_view word = text.substr(colon + 2);
  if (word.starts_with("ACTIVE")) {  // also "ACTIVE_DEFER"
    return "up";
  }
  for (const std::string_view down : {"NOP", "DOWN", "INIT", "ARMED"}) {
    if (word == down) {
      return "down";
    }
  }
  return std::nullopt;
}

}  // namespace agent::discovery
