#include <agent/discovery/Values.h>
#include <agent/discovery/tpm/TpmCapabilities.h>

#include <algorithm>

namespace agent::discovery {

namespace {

/// The id's bytes are characters, the first in the highest byte, blanks or NULs behind.
std::optional<std::string> makerOf(std::string_view value) {
  const std::optional<std::uint32_t> id = parseNumber(value);
  if (!id) {
    return std::nullopt;
  }
  std::string text;
  for (int shift = 24; shift >= 0; shift -= 8) {
    const auto character = static_cast<char>((*id >> static_cast<unsigned>(shift)) & 0xffU);
    if (character == '\0') {
      break;
    }
    if (character < ' ' || character > '~') {
      return std::nullopt;
    }
    text += character;
  }
  return meaningful(text);
}

void takeVersion(std::string_view value, TpmCapabilities& capabilities) {
  capabilities.version = meaningful(value);
  if (!capabilities.version || isZeroVersion(*capabilities.version)) {
    capabilities.version.reset();
    return;
  }
  const std::string_view version = *capabilities.version;
  const std::size_t dot = std::min(version.find('.'), version.size());
  const auto major = parseNumber(version.substr(0, dot), 0xff);
  const auto minor = parseNumber(version.substr(std::min(dot + 1, version.size())), 0xff);
  if (major && minor) {
    capabilities.major = major;
    capabilities.minor = minor;
  }
}

}  // namespace

TpmCapabilities parseTpmCapabilities(std::string_view text) {
  static constexpr std::string_view makerKey = "Manufacturer:";
  static constexpr std::string_view versionKey = "Firmware version:";
  TpmCapabilities capabilities;
  while (!text.empty()) {
    const std::size_t end = std::min(text.find('\n'), text.size());
    const std::string_view line = text.substr(0, end);
    if (line.starts_with(makerKey)) {
      capabilities.maker = makerOf(line.substr(makerKey.size()));
    } else if (line.starts_with(versionKey)) {
      takeVersion(line.substr(versionKey.size()), capabilities);
    }
    text.remove_prefix(std::min(end + 1, text.size()));
  }
  return capabilities;
}

}  // namespace agent::discovery
