#include <agent/discovery/Elements.h>
#include <agent/discovery/Values.h>
#include <agent/discovery/dmi/DeclaredFirmware.h>
#include <agent/discovery/dmi/DmiTables.h>
#include <agent/discovery/dmi/DmiValues.h>
#include <agent/framework/Case.h>

#include <Oru/NodeLexicon.h>

#include <algorithm>
#include <array>
#include <limits>
#include <string_view>
#include <utility>

namespace agent::discovery {

namespace {

using smbios::Firmware;
using smbios::Structure;

/// What the structure that a component handle leads to says of the component.
struct ComponentKind {
  std::uint8_t type = 0;
  std::string_view firmware;   ///< what its firmware is described as; empty: nothing of its own
  std::string_view device;     ///< what it is described as; empty: the computer itself
  std::size_t nameOffset = 0;  ///< of the string that names its place
};

constexpr std::array<ComponentKind, 10> componentKinds{{
    {smbios::BiosType, "BIOS", "", 0},
    {smbios::IpmiDeviceType, "BMC Firmware", "", 0},
    {smbios::HostInterfaceType, "BMC Firmware", "", 0},
    {smbios::TpmType, tpmFirmware, "TPM", 0},
    {smbios::ProcessorType, "", "Processor", 0x04},
    {smbios::SlotType, "", "Expansion Slot", 0x04},
    {smbios::MemoryDeviceType, "", "Memory Module", 0x10},
    {smbios::BatteryType, "", "Battery", 0x04},
    {smbios::PowerSupplyType, "", "Power Supply", 0x05},
    {smbios::OnboardDeviceType, "", "Onboard Device", 0x04},
}};

std::optional<std::string> meant(const std::optional<std::string_view>& text) {
  return text ? meaningful(*text) : std::nullopt;
}

/// The id that the firmware is updated by; GUIDs in lower case, as the kernel writes them.
std::optional<std::string> idOf(const Firmware& firmware) {
  std::optional<std::string> id = meant(firmware.id);
  if (!id || isUnset(*id)) {
    return std::nullopt;
  }
  if (firmware.isGuid) {
    std::transform(id->begin(), id->end(), id->begin(), lower);
  }
  return id;
}

/// The node of a device other than the computer; nothing where the structure does not say where it is.
std::optional<FoundNode> componentDevice(const ComponentKind& kind, const Structure& structure) {
  if (kind.type == smbios::TpmType) {
    return deviceNode(tpmPosition, std::string(kind.device));
  }
  const std::optional<std::string> name = meant(structure.stringAt(kind.nameOffset));
  if (kind.type == smbios::SlotType || kind.type == smbios::OnboardDeviceType) {
    const std::optional<std::string> address = smbios::pciAddress(structure);
    return address ? std::optional(deviceNode(*address, std::string(kind.device), {name, {}})) : std::nullopt;
  }
  return name ? std::optional(deviceNode("dmi:" + std::to_string(kind.type) + "/" + *name,
                                         std::string(kind.device), {name, {}}))
              : std::nullopt;
}

/// Finds what the firmware belongs to: the first component that tells.
void findComponent(DeclaredFirmware& declared, const Firmware& firmware,
                   const StructuresByHandle& structures) {
  for (const std::uint16_t handle : firmware.components) {
    const auto structure = structures.find(handle);
    if (structure == structures.end()) {
      continue;
    }
    const auto* const kind =
        std::find_if(componentKinds.begin(), componentKinds.end(),
                     [&](const ComponentKind& known) { return known.type == structure->second.type(); });
    if (kind == componentKinds.end()) {
      continue;
    }
    if (kind->device.empty()) {
      declared.kind = kind->firmware;
      return;
    }
    declared.device = componentDevice(*kind, structure->second);
    if (declared.device) {
      declared.kind = kind->firmware;
      return;
    }
  }
}

/// The standard's states from 1 on; nothing for "unknown" and for what it does not know.
std::optional<std::string> stateText(std::uint8_t state) {
  static constexpr std::array<std::string_view, 9> states = {
      "", "other", "", "disabled", "enabled", "absent", "standby", "spare", "unavailable"};
  if (state >= states.size() || states[state].empty()) {
    return std::nullopt;
  }
  return std::string(states[state]);
}

std::string updateText(std::uint16_t characteristics) {
  static constexpr unsigned int updatable = 1;
  static constexpr unsigned int writeProtected = 2;
  return std::string((characteristics & updatable) != 0 ? "updatable" : "not updatable") +
         ((characteristics & writeProtected) != 0 ? ", write-protected" : "");
}

void setNumbers(SourceContext& context, const std::string& place, const Firmware& firmware, FoundNode& node) {
  if (firmware.versionFormat == Firmware::MajorMinor) {
    // A text of another form is a version all the same: boards exist that give this format to "K71V204".
    if (const auto numbers = parseMajorMinor(meant(firmware.version).value_or(""))) {
      node.setValue(Oru::NodeLexicon::MajorVersionProperty, numbers->major);
      node.setValue(Oru::NodeLexicon::MinorVersionProperty, numbers->minor);
    }
  }
  if (!firmware.imageSize) {
    return;
  }
  if (*firmware.imageSize > std::numeric_limits<std::uint32_t>::max()) {
    context.report(place, SourceReport::Reason::Unreadable,
                   "an image of " + std::to_string(*firmware.imageSize) + " bytes is larger than 4 GiB");
    return;
  }
  node.setValue(ImageSizeProperty, static_cast<std::uint32_t>(*firmware.imageSize));
}

void setDate(SourceContext& context, const std::string& place, const Firmware& firmware, FoundNode& node) {
  const std::optional<std::string> text = meant(firmware.date);
  if (!text || isUnset(*text)) {
    return;
  }
  const std::optional<std::string> date = parseFirmwareDate(*text);
  if (!date) {
    context.report(place, SourceReport::Reason::Unreadable, "\"" + *text + "\" is no date of a known form");
  }
  node.setText(Oru::NodeLexicon::ReleaseDateProperty, date);
}

void setTexts(const Firmware& firmware, FoundNode& node) {
  node.setText(Oru::NodeLexicon::NameProperty, meant(firmware.name));
  node.setText(Oru::NodeLexicon::ManufacturerProperty, meant(firmware.maker));
  node.setText(Oru::NodeLexicon::VersionStringProperty, meant(firmware.version));
  node.setText(LowestVersionProperty, meant(firmware.lowestVersion));
  node.setText(FirmwareIdProperty, idOf(firmware));
  if (firmware.state) {
    node.setText(StateProperty, stateText(*firmware.state));
  }
  if (firmware.characteristics) {
    node.setText(UpdateProperty, updateText(*firmware.characteristics));
  }
}

}  // namespace

std::optional<DeclaredFirmware> declaredFirmware(SourceContext& context, const std::string& place,
                                                 const Structure& structure,
                                                 const StructuresByHandle& structures) {
  static constexpr std::uint8_t absentState = 5;
  const Firmware firmware = smbios::decodeFirmware(structure);
  if (structure.length() < firmware.neededLength) {
    context.report(place, SourceReport::Reason::Unreadable,
                   "it has " + std::to_string(structure.length()) + " bytes, expected " +
                       std::to_string(firmware.neededLength) + ": the fields beyond them are missing");
  }
  const std::string name = meant(firmware.name).value_or("");
  if (firmware.state == absentState || !meant(firmware.version)) {
    context.report(
        place, SourceReport::Reason::Absent,
        "\"" + name + (firmware.state == absentState ? "\" is declared as absent" : "\" has no version"));
    return std::nullopt;
  }
  DeclaredFirmware declared;
  declared.list = structure.type();
  findComponent(declared, firmware, structures);
  declared.node.type = Oru::NodeLexicon::FirmwareNode;
  declared.node.description = "Declared Firmware";
  setTexts(firmware, declared.node);
  setNumbers(context, place, firmware, declared.node);
  setDate(context, place, firmware, declared.node);
  declared.node.position = (declared.device ? declared.device->position + "/" : std::string()) + "declared/" +
                           idOf(firmware).value_or(name);
  return declared;
}

}  // namespace agent::discovery
