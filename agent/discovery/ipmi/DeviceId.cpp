#include <agent/discovery/ipmi/DeviceId.h>

#include <algorithm>
#include <array>
#include <charconv>

namespace agent::discovery {

namespace {

constexpr std::uint8_t revisionBits = 0x7f;  // the highest bit says that the controller is not ready yet
constexpr std::size_t auxiliaryCount = 4;
using AuxiliaryBytes = std::array<std::uint8_t, auxiliaryCount>;

std::string twoDigits(std::uint8_t byte) {
  static constexpr std::string_view digits = "0123456789abcdef";
  return {digits[byte >> 4U], digits[byte & 0x0fU]};
}

std::optional<std::uint32_t> fromBcd(std::uint8_t byte) {
  const std::uint32_t tens = byte >> 4U;
  const std::uint32_t ones = byte & 0x0fU;
  return tens < 10 && ones < 10 ? std::optional(tens * 10 + ones) : std::nullopt;
}

std::optional<std::string> auxiliaryText(const AuxiliaryBytes& bytes) {
  if (std::all_of(bytes.begin(), bytes.end(), [](std::uint8_t byte) { return byte == 0; })) {
    return std::nullopt;
  }
  std::string text;
  for (const std::uint8_t byte : bytes) {
    text += (text.empty() ? "" : " ") + twoDigits(byte);
  }
  return text;
}

ControllerFirmware firmwareOf(std::uint8_t major, std::uint8_t minor, const AuxiliaryBytes& auxiliary) {
  const std::uint32_t number = major & revisionBits;
  ControllerFirmware firmware{
      std::to_string(number) + "." + twoDigits(minor), number, fromBcd(minor), auxiliaryText(auxiliary), {}};
  if (firmware.auxiliary) {
    std::string whole = *firmware.auxiliary;
    std::replace(whole.begin(), whole.end(), ' ', '.');
    firmware.otherForms = {firmware.version + "." + twoDigits(auxiliary[0]), firmware.version + "." + whole};
  }
  return firmware;
}

/// The byte that all of `text` is, in at most `digits` digits.
std::optional<std::uint8_t> parseByte(std::string_view text, int base, std::size_t digits) {
  std::uint8_t byte = 0;
  const char* const end = text.data() + text.size();
  const auto [stop, error] = std::from_chars(text.data(), end, byte, base);
  if (text.empty() || text.size() > digits || error != std::errc() || stop != end) {
    return std::nullopt;
  }
  return byte;
}

std::optional<AuxiliaryBytes> parseAuxiliary(std::string_view text) {
  static constexpr std::string_view prefix = "0x";
  static constexpr std::size_t width = 4;
  AuxiliaryBytes bytes{};
  for (std::size_t i = auxiliaryCount; i-- > 0;) {
    const std::string_view word = text.substr(0, std::min(width, text.size()));
    const auto byte = word.starts_with(prefix) ? parseByte(word.substr(2), 16, 2) : std::nullopt;
    if (!byte) {
      return std::nullopt;
    }
    bytes.at(i) = *byte;
    text.remove_prefix(word.size());
    if (i > 0) {
      if (!text.starts_with(' ')) {
        return std::nullopt;
      }
      text.remove_prefix(1);
    }
  }
  return text.empty() ? std::optional(bytes) : std::nullopt;
}

}  // namespace

std::optional<ControllerFirmware> parseDeviceId(std::span<const std::byte> data) {
  // Device id, device revision, firmware revision (2), IPMI version, support, maker (3), product (2),
  // auxiliary (4, not all controllers send them).
  static constexpr std::size_t majorAt = 2;
  static constexpr std::size_t minorAt = 3;
  static constexpr std::size_t auxiliaryAt = 11;
  static constexpr std::size_t shortest = 5;
  if (data.size() < shortest) {
    return std::nullopt;
  }
  AuxiliaryBytes auxiliary{};
  if (data.size() >= auxiliaryAt + auxiliaryCount) {
    for (std::size_t i = 0; i < auxiliaryCount; ++i) {
      auxiliary.at(i) = std::to_integer<std::uint8_t>(data[auxiliaryAt + i]);
    }
  }
  return firmwareOf(std::to_integer<std::uint8_t>(data[majorAt]),
                    std::to_integer<std::uint8_t>(data[minorAt]), auxiliary);
}

std::optional<ControllerFirmware> parseRevisionText(std::string_view revision,
                                                    const std::optional<std::string>& auxiliary) {
  const std::size_t dot = revision.find('.');
  if (dot == std::string_view::npos) {
    return std::nullopt;
  }
  const auto major = parseByte(revision.substr(0, dot), 10, 3);
  const auto minor = parseByte(revision.substr(dot + 1), 16, 2);
  if (!major || !minor) {
    return std::nullopt;
  }
  return firmwareOf(*major, *minor,
                    auxiliary ? parseAuxiliary(*auxiliary).value_or(AuxiliaryBytes{}) : AuxiliaryBytes{});
}

}  // namespace agent::discovery
