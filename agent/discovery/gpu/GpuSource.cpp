#include <agent/discovery/BusAddress.h>
#include <agent/discovery/Elements.h>
#include <agent/discovery/Values.h>
#include <agent/discovery/gpu/GpuSource.h>

#include <map>
#include <utility>

namespace agent::discovery {

namespace {

/// Of cards alone, "card0": their connectors ("card0-HDMI-A-1") stand in the same folder.
bool isCard(std::string_view name) {
  static constexpr std::string_view prefix = "card";
  return name.starts_with(prefix) &&
         name.find_first_not_of("0123456789", prefix.size()) == std::string_view::npos;
}

}  // namespace

void readGpu(SourceContext& context) {
  std::map<std::string, FoundNode> byAddress;
  for (const std::string& name : context.listIfAny("sys/class/drm")) {
    const std::string folder = "sys/class/drm/" + name + "/device";
    const std::optional<std::string> version =
        isCard(name) ? context.textIfAny(folder + "/vbios_version") : std::nullopt;
    if (!version || isZeroVersion(*version)) {
      continue;
    }
    const Outcome<std::string> resolved = context.root().resolve(folder);
    const std::string address = functionAddress(context, resolved ? *resolved.value : folder);
    FoundNode device = deviceNode(address, "Graphics Processor");
    device.children.push_back(firmwareNode(address + "/video/bios", "Video BIOS", *version));
    byAddress.emplace(address, std::move(device));
  }
  for (auto& [address, device] : byAddress) {
    context.result().nodes.push_back(std::move(device));
  }
}

}  // namespace agent::discovery
