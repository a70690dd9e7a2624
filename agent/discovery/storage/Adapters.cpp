#include <agent/discovery/BusAddress.h>
#include <agent/discovery/Elements.h>
#include <agent/discovery/Values.h>
#include <agent/discovery/storage/ScsiPlace.h>
#include <agent/discovery/storage/StorageSource.h>

#include <initializer_list>
#include <map>
#include <utility>

namespace agent::discovery {

namespace {

struct Adapter {
  Label label;
  std::optional<std::string> firmware;
  std::optional<std::string> bios;
  std::optional<std::string> optionRom;
};

/// By the address of the adapter's function: one with several hosts is one adapter.
using Adapters = std::map<std::string, Adapter>;

/// The first of the attributes that says anything, unless it is known already.
void fill(SourceContext& context, std::optional<std::string>& known, const std::string& folder,
          std::initializer_list<const char*> attributes) {
  for (const char* const attribute : attributes) {
    if (known) {
      return;
    }
    const std::optional<std::string> text = context.textIfAny(within(folder, attribute));
    if (text && !isZeroVersion(*text)) {
      known = text;
    }
  }
}

/// Calls `read` with the folder of each host of a class and the adapter that it belongs to.
template <typename Read>
void eachHost(SourceContext& context, const std::string& classFolder, Adapters& adapters, const Read& read) {
  for (const std::string& name : context.listIfAny(classFolder)) {
    const std::string folder = within(classFolder, name);
    const Outcome<std::string> resolved = context.root().resolve(folder);
    if (!resolved) {
      context.reportError(context.root().outside(folder), resolved.error);
      continue;
    }
    const std::optional<HostPlace> host = hostIn(*resolved.value);
    if (!host) {
      continue;
    }
    read(folder, adapters[functionAddress(context, host->above)]);
  }
}

FoundNode nodeOf(const std::string& address, const Adapter& adapter) {
  FoundNode node = deviceNode(address, "Storage Adapter", adapter.label);
  const auto add = [&](const char* place, const char* description, const std::optional<std::string>& text) {
    if (text) {
      node.children.push_back(firmwareNode(address + place, description, *text, adapter.label));
    }
  };
  add("/storage/firmware", "Storage Adapter Firmware", adapter.firmware);
  add("/storage/bios", "Storage Adapter BIOS", adapter.bios);
  add("/storage/rom", "Storage Adapter Option ROM", adapter.optionRom);
  return node;
}

}  // namespace

std::vector<FoundNode> readAdapters(SourceContext& context) {
  Adapters adapters;
  eachHost(context, "sys/class/scsi_host", adapters, [&](const std::string& folder, Adapter& adapter) {
    fill(context, adapter.firmware, folder,
         {"version_fw", "firmware_revision", "firmware_version", "fw_version", "fwrev"});
    fill(context, adapter.bios, folder, {"version_bios"});
    fill(context, adapter.label.name, folder, {"board_name", "model_name", "modelname"});
  });
  eachHost(context, "sys/class/fc_host", adapters, [&](const std::string& folder, Adapter& adapter) {
    fill(context, adapter.firmware, folder, {"firmware_version"});
    fill(context, adapter.optionRom, folder, {"optionrom_version"});
    fill(context, adapter.label.name, folder, {"model"});
    fill(context, adapter.label.maker, folder, {"manufacturer"});
  });
  std::vector<FoundNode> nodes;
  for (const auto& [address, adapter] : adapters) {
    FoundNode node = nodeOf(address, adapter);
    if (!node.children.empty()) {
      nodes.push_back(std::move(node));
    }
  }
  return nodes;
}

}  // namespace agent::discovery
