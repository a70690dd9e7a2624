#include <agent/discovery/Elements.h>
#include <agent/discovery/Values.h>
#include <agent/discovery/storage/AtaPage.h>
#include <agent/discovery/storage/ScsiPlace.h>
#include <agent/discovery/storage/StorageSource.h>

#include <algorithm>
#include <cerrno>
#include <map>
#include <tuple>
#include <utility>

namespace agent::discovery {

namespace {

/// What a peripheral device type (SPC) is called here.
struct Kind {
  const char* device;
  const char* firmware;
};

Kind kindOf(std::uint32_t type) {
  switch (type) {
    case 0x00:  // disk
    case 0x0e:  // simplified disk
    case 0x14:  // zoned disk
      return {"Drive", "Drive Firmware"};
    case 0x01:
      return {"Tape Drive", "Drive Firmware"};
    case 0x04:  // write-once
    case 0x05:  // CD, DVD
    case 0x07:  // magneto-optical
      return {"Optical Drive", "Drive Firmware"};
    case 0x08:
      return {"Media Changer", "Media Changer Firmware"};
    case 0x0c:
      return {"Storage Controller", "Storage Controller Firmware"};
    case 0x0d:
      return {"Storage Enclosure", "Storage Enclosure Firmware"};
    default:
      return {"Storage Device", "Storage Device Firmware"};
  }
}

struct ScsiDevice {
  Kind kind{};
  Label label;
  std::optional<std::string> version;
};

std::optional<AtaIdentity> readAtaPage(SourceContext& context, const std::string& folder) {
  const std::string path = folder + "/vpd_pg89";
  context.doing(context.root().outside(path));
  const Outcome<std::string> page = context.root().read(path);
  if (page) {
    return parseAtaPage(*page.value);
  }
  // EINVAL: the attribute is there, and the device has no such page.
  if (reasonOf(page.error) != SourceReport::Reason::Absent && page.error != EINVAL) {
    context.reportError(context.root().outside(path), page.error);
  }
  return std::nullopt;
}

ScsiDevice readDevice(SourceContext& context, const std::string& folder) {
  static constexpr std::uint32_t unknownType = 0x1f;
  const std::optional<std::string> type = context.textIfAny(folder + "/type");
  ScsiDevice device;
  device.kind = kindOf(type ? parseNumber(*type).value_or(unknownType) : unknownType);
  device.version = context.textIfAny(folder + "/rev");
  device.label.name = context.textIfAny(folder + "/model");
  device.label.maker = context.textIfAny(folder + "/vendor");
  if (device.label.maker == "ATA") {  // the translation's own word: it has no other
    device.label.maker.reset();
  }
  if (const std::optional<AtaIdentity> ata = readAtaPage(context, folder)) {
    device.version = ata->firmware ? ata->firmware : device.version;
    device.label.name = ata->model ? ata->model : device.label.name;
  }
  return device;
}

FoundNode nodeOf(const std::string& place, const ScsiDevice& device) {
  FoundNode node = deviceNode(place, device.kind.device, device.label);
  node.children.push_back(
      firmwareNode(place + "/firmware", device.kind.firmware, *device.version, device.label));
  return node;
}

std::vector<ScsiAddress> addresses(SourceContext& context) {
  std::vector<ScsiAddress> found;
  for (const std::string& name : context.listIfAny("sys/class/scsi_device")) {
    if (const auto address = parseScsiAddress(name)) {
      found.push_back(*address);
    }
  }
  std::sort(found.begin(), found.end());
  return found;
}

std::string nameOf(const ScsiAddress& address) {
  return std::to_string(address.host) + ":" + std::to_string(address.channel) + ":" +
         std::to_string(address.target) + ":" + std::to_string(address.lun);
}

}  // namespace

std::vector<FoundNode> readScsiDevices(SourceContext& context) {
  // A target shows itself once for each of its logical units; what says the same there is one device.
  using Same = std::tuple<std::string, std::optional<std::string>, std::optional<std::string>>;
  std::map<Same, bool> known;
  std::map<std::string, FoundNode> byPlace;
  for (const ScsiAddress& address : addresses(context)) {
    const std::string link = "sys/class/scsi_device/" + nameOf(address) + "/device";
    const Outcome<std::string> folder = context.root().resolve(link);
    if (!folder) {
      context.reportError(context.root().outside(link), folder.error);
      continue;
    }
    const ScsiDevice device = readDevice(context, *folder.value);
    if (!device.version) {
      continue;
    }
    const std::string target = targetPlace(context, *folder.value, address);
    if (known.emplace(Same{target, device.label.maker, device.label.name}, true).second) {
      const std::string place = target + ":" + std::to_string(address.lun);
      byPlace.emplace(place, nodeOf(place, device));
    }
  }
  std::vector<FoundNode> nodes;
  nodes.reserve(byPlace.size());
  for (auto& [place, node] : byPlace) {
    nodes.push_back(std::move(node));
  }
  return nodes;
}

}  // namespace agent::discovery
