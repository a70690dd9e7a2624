// The forms that SMBIOS gives to dates and releases.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

namespace agent::discovery {

/// "MM/DD/YYYY" of a date in SMBIOS form: month, day and year by number, with "/" between. A year of two
/// digits is one of the 1900s, as SMBIOS has it. Nothing where the text has another form or names no day of
/// the calendar.
std::optional<std::string> parseBiosDate(std::string_view text);

struct BiosRelease {
  std::uint32_t major = 0;
  std::uint32_t minor = 0;

  /// SMBIOS marks a firmware without a release number this way.
  [[nodiscard]] bool isAbsent() const { return major == 255 && minor == 255; }
};

/// "5.17"; each part is one byte.
std::optional<BiosRelease> parseBiosRelease(std::string_view text);

}  // namespace agent::discovery
