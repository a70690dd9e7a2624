#include <agent/framework/Names.h>
#include <agent/framework/OwnNumbers.h>

#include <Oru/NodeLexicon.h>

#include <algorithm>
#include <array>
#include <span>

namespace agent {
namespace {

struct Name {
  int number;
  std::string_view text;
};

constexpr std::array<Name, 8> nodeTypes{{
    {Oru::NodeLexicon::BiosNode, "Bios"},
    {Oru::NodeLexicon::FirmwareNode, "Firmware"},
    {Oru::NodeLexicon::NetworkPortNode, "NetworkPort"},
    {Oru::NodeLexicon::ComputerSystemNode, "ComputerSystem"},
    {Oru::NodeLexicon::ApplicationSoftwareNode, "ApplicationSoftware"},
    {Oru::NodeLexicon::DriverNode, "Driver"},
    {Oru::NodeLexicon::NetworkDeviceNode, "NetworkDevice"},
    {DeviceNode, "Device"},
}};

constexpr std::array<Name, 22> properties{{
    {Oru::NodeLexicon::ManufacturerProperty, "Manufacturer"},
    {Oru::NodeLexicon::MajorVersionProperty, "MajorVersion"},
    {Oru::NodeLexicon::MinorVersionProperty, "MinorVersion"},
    {Oru::NodeLexicon::NameProperty, "Name"},
    {Oru::NodeLexicon::FirmwareRevisionProperty, "FirmwareRevision"},
    {Oru::NodeLexicon::DriverVersionProperty, "DriverVersion"},
    {Oru::NodeLexicon::ReleaseDateProperty, "ReleaseDate"},
    {Oru::NodeLexicon::BuildIdProperty, "BuildId"},
    {Oru::NodeLexicon::ElementSoftwareStatusProperty, "ElementSoftwareStatus"},
    {Oru::NodeLexicon::VersionStringProperty, "VersionString"},
    {DrivenDevicesProperty, "DrivenDevices"},
    {PermanentAddressProperty, "PermanentAddress"},
    {LinkTechnologyProperty, "LinkTechnology"},
    {SpeedProperty, "Speed"},
    {StateProperty, "State"},
    {FirmwareIdProperty, "FirmwareId"},
    {LowestVersionProperty, "LowestVersion"},
    {ImageSizeProperty, "ImageSize"},
    {UpdateProperty, "Update"},
    {LastAttemptProperty, "LastAttempt"},
    {StoredVersionProperty, "StoredVersion"},
    {DeviceDetailsProperty, "DeviceDetails"},
}};

std::optional<std::string_view> nameIn(std::span<const Name> names, int number) {
  const auto found =
      std::find_if(names.begin(), names.end(), [&](const Name& name) { return name.number == number; });
  return found == names.end() ? std::nullopt : std::optional(found->text);
}

std::optional<int> numberIn(std::span<const Name> names, std::string_view text) {
  const auto found =
      std::find_if(names.begin(), names.end(), [&](const Name& name) { return name.text == text; });
  return found == names.end() ? std::nullopt : std::optional(found->number);
}

}  // namespace

std::optional<std::string_view> nodeTypeName(int type) {
  return nameIn(nodeTypes, type);
}
std::optional<int> nodeTypeNamed(std::string_view name) {
  return numberIn(nodeTypes, name);
}

std::optional<std::string_view> propertyName(int property) {
  return nameIn(properties, property);
}
std::optional<int> propertyNamed(std::string_view name) {
  return numberIn(properties, name);
}

}  // namespace agent
