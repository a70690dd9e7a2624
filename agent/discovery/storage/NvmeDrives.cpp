#include <agent/discovery/BusAddress.h>
#include <agent/discovery/Elements.h>
#include <agent/discovery/storage/StorageSource.h>

#include <algorithm>
#include <array>
#include <map>
#include <utility>

namespace agent::discovery {

namespace {

/// Whether the drive is part of another machine, reached over a network.
bool isRemote(SourceContext& context, const std::string& folder) {
  static constexpr std::array<std::string_view, 4> networks = {"tcp", "rdma", "fc", "loop"};
  const std::optional<std::string> transport = context.textIfAny(folder + "/transport");
  return transport && std::find(networks.begin(), networks.end(), *transport) != networks.end();
}

}  // namespace

std::vector<FoundNode> readNvmeDrives(SourceContext& context) {
  std::map<std::string, FoundNode> byAddress;
  for (const std::string& name : context.listIfAny("sys/class/nvme")) {
    const std::string folder = "sys/class/nvme/" + name;
    const Outcome<std::string> resolved = context.root().resolve(folder);
    if (!resolved || isRemote(context, folder)) {
      continue;
    }
    const std::optional<std::string> version = context.text(folder + "/firmware_rev");
    if (!version) {
      continue;
    }
    const std::string address = functionAddress(context, *resolved.value);
    const Label label{context.textIfAny(folder + "/model"), std::nullopt};
    FoundNode drive = deviceNode(address, "NVMe Drive", label);
    drive.children.push_back(firmwareNode(address + "/drive/firmware", "Drive Firmware", *version, label));
    byAddress.emplace(address, std::move(drive));
  }
  std::vector<FoundNode> drives;
  drives.reserve(byAddress.size());
  for (auto& [address, drive] : byAddress) {
    drives.push_back(std::move(drive));
  }
  return drives;
}

}  // namespace agent::discovery
