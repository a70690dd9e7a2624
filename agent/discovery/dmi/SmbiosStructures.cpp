#include <agent/discovery/dmi/SmbiosStructures.h>

#include <array>
#include <charconv>
#include <limits>

namespace agent::discovery::smbios {

namespace {

/// Two bytes, of which 255 and 255 stand for "none".
std::optional<ReleaseNumbers> releaseAt(const Structure& structure, std::size_t offset) {
  const auto major = structure.at<std::uint8_t>(offset);
  const auto minor = structure.at<std::uint8_t>(offset + 1);
  if (!major || !minor) {
    return std::nullopt;
  }
  const ReleaseNumbers release{*major, *minor};
  return release.isAbsent() ? std::nullopt : std::optional(release);
}

std::string hexadecimal(std::uint32_t number) {
  std::array<char, 8> digits{};
  char* const end = std::to_chars(digits.data(), digits.data() + digits.size(), number, 16).ptr;
  return {digits.data(), end};
}

void setTpmVersion(Tpm& tpm, std::uint32_t major, std::uint32_t minor, std::uint32_t rest) {
  if (major == 0 && minor == 0 && rest == 0) {
    return;
  }
  tpm.release = ReleaseNumbers{major, minor};
  tpm.version = std::to_string(major) + "." + std::to_string(minor);
  const std::string whole =
      tpm.version + "." + std::to_string(rest >> 16U) + "." + std::to_string(rest & 0xffffU);
  tpm.otherVersions = {tpm.version, whole};
  if (rest != 0) {
    tpm.version = whole;
  }
}

void appendHexadecimal(std::string& text, std::uint32_t number, unsigned int digits) {
  static constexpr std::string_view letters = "0123456789abcdef";
  while (digits > 0) {
    --digits;
    text += letters[(number >> (4 * digits)) & 0xfU];
  }
}

}  // namespace

Bios decodeBios(const Structure& structure) {
  return {structure.stringAt(0x04), structure.stringAt(0x05), structure.stringAt(0x08),
          releaseAt(structure, 0x14), releaseAt(structure, 0x16)};
}

Tpm decodeTpm(const Structure& structure) {
  static constexpr std::size_t vendorOffset = 0x04;
  static constexpr std::size_t versionOffset = 0x0a;
  Tpm tpm;
  for (std::size_t offset = vendorOffset; offset < vendorOffset + 4; ++offset) {
    if (const std::uint8_t character = structure.at<std::uint8_t>(offset).value_or(0); character != 0) {
      tpm.vendor += static_cast<char>(character);
    }
  }
  tpm.description = structure.stringAt(0x12);
  const auto first = structure.at<std::uint32_t>(versionOffset);
  const auto second = structure.at<std::uint32_t>(versionOffset + 4);
  if (!first || !second) {
    return tpm;
  }
  if (structure.at<std::uint8_t>(0x08) == 1) {
    // A TPM 1.2: four bytes, the version of its interface before that of its firmware.
    setTpmVersion(tpm, *first >> 16U & 0xffU, *first >> 24U, 0);
  } else {
    setTpmVersion(tpm, *first >> 16U, *first & 0xffffU, *second);
    tpm.otherVersions.push_back(hexadecimal(*first) + "." + hexadecimal(*second));
  }
  return tpm;
}

Firmware decodeFirmware(const Structure& structure) {
  Firmware firmware;
  firmware.name = structure.stringAt(0x04);
  firmware.version = structure.stringAt(0x05);
  firmware.versionFormat = structure.at<std::uint8_t>(0x06).value_or(Firmware::FreeForm);
  firmware.id = structure.stringAt(0x07);
  firmware.isGuid = structure.at<std::uint8_t>(0x08) == 1;
  firmware.date = structure.stringAt(0x09);
  firmware.maker = structure.stringAt(0x0a);
  firmware.lowestVersion = structure.stringAt(0x0b);
  if (const std::uint64_t size = structure.at<std::uint64_t>(0x0c).value_or(0);
      size != 0 && size != std::numeric_limits<std::uint64_t>::max()) {
    firmware.imageSize = size;
  }
  firmware.characteristics = structure.at<std::uint16_t>(0x14);
  firmware.state = structure.at<std::uint8_t>(0x16);
  const std::size_t components = structure.at<std::uint8_t>(0x17).value_or(0);
  firmware.neededLength = Firmware::fixedLength + 2 * components;
  for (std::size_t i = 0; i < components; ++i) {
    if (const auto handle = structure.at<std::uint16_t>(Firmware::fixedLength + 2 * i)) {
      firmware.components.push_back(*handle);
    }
  }
  return firmware;
}

std::optional<std::string> pciAddress(const Structure& structure) {
  const bool isSlot = structure.type() == SlotType;
  const auto segment = structure.at<std::uint16_t>(isSlot ? 0x0d : 0x07);
  const auto bus = structure.at<std::uint8_t>(isSlot ? 0x0f : 0x09);
  const auto function = structure.at<std::uint8_t>(isSlot ? 0x10 : 0x0a);
  // All ones where the device is on another bus than PCI.
  if (!segment || !bus || !function || (*bus == 0xff && *function == 0xff)) {
    return std::nullopt;
  }
  std::string address;
  appendHexadecimal(address, *segment, 4);
  address += ':';
  appendHexadecimal(address, *bus, 2);
  address += ':';
  appendHexadecimal(address, *function >> 3U, 2);
  address += '.';
  appendHexadecimal(address, *function & 7U, 1);
  return address;
}

}  // namespace agent::discovery::smbios
