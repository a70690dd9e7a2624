// The structures of SMBIOS (DSP0134) that tell of firmware, field by field.
//
// Texts are as they stand in the table, and are views of it. A field that is beyond its structure's length,
// or holds what the standard has for "none", is absent.
#pragma once

#include <agent/discovery/dmi/DmiValues.h>
#include <agent/discovery/dmi/SmbiosTable.h>

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace agent::discovery::smbios {

/// The types of structures that something here reads.
enum Type : std::uint8_t {
  BiosType = 0,
  ProcessorType = 4,
  SlotType = 9,
  MemoryDeviceType = 17,
  BatteryType = 22,
  IpmiDeviceType = 38,
  PowerSupplyType = 39,
  OnboardDeviceType = 41,
  HostInterfaceType = 42,
  TpmType = 43,
  FirmwareType = 45,
};

/// Type 0.
struct Bios {
  std::optional<std::string_view> vendor;
  std::optional<std::string_view> version;
  std::optional<std::string_view> date;
  std::optional<ReleaseNumbers> release;  ///< 255.255 is none; none in structures before version 2.4
  std::optional<ReleaseNumbers> controllerRelease;  ///< of the embedded controller's firmware; as above
};
Bios decodeBios(const Structure& structure);

/// Type 43.
struct Tpm {
  std::string vendor;  ///< the id that the TPM's vendor goes by, up to 4 characters; may be empty
  std::optional<std::string_view> description;
  /// Of the TPM's firmware; none where the structure is too short, or where all of the version is 0.
  std::optional<ReleaseNumbers> release;
  std::string version;  ///< the release as text; with the rest of the version where there is one
  std::vector<std::string> otherVersions;  ///< as other tables and tools write the same
};
Tpm decodeTpm(const Structure& structure);

/// Type 45.
struct Firmware {
  /// The fields up to the number of components.
  static constexpr std::size_t fixedLength = 0x18;
  enum Format : std::uint8_t { FreeForm = 0, MajorMinor = 1, Hexadecimal32 = 2, Hexadecimal64 = 3 };

  std::optional<std::string_view> name;
  std::optional<std::string_view> version;
  std::uint8_t versionFormat = FreeForm;
  std::optional<std::string_view> id;
  bool isGuid = false;  ///< of the id, as the structure says
  std::optional<std::string_view> date;
  std::optional<std::string_view> maker;
  std::optional<std::string_view> lowestVersion;
  std::optional<std::uint64_t> imageSize;  ///< in bytes
  std::optional<std::uint16_t> characteristics;
  std::optional<std::uint8_t> state;
  std::vector<std::uint16_t> components;   ///< handles, as far as the structure holds them
  std::size_t neededLength = fixedLength;  ///< of the structure, for all that it should hold
};
Firmware decodeFirmware(const Structure& structure);

/// Where a slot's or an onboard device's structure says that the device is: "0000:3b:00.0".
std::optional<std::string> pciAddress(const Structure& structure);

}  // namespace agent::discovery::smbios
