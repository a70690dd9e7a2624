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

/// "MM/DD/YYYY" of a date as declared firmware has it: in SMBIOS form, or year, month and day as ISO 8601 has
/// them ("2022-04-11", "20220411"), alone or with a time of the day behind it ("2022-04-11T00:00:00Z"). The
/// day stays the one that is written, whatever the time zone. Nothing where the text has another form or
/// names no day of the calendar.
std::optional<std::string> parseFirmwareDate(std::string_view text);

/// Whether a text is nothing but zeros and what stands between them, the way to write that nobody set it:
/// "00000000-0000-0000-0000-000000000000", "0000-00-00T00:00:00Z".
bool isUnset(std::string_view text);

struct ReleaseNumbers {
  std::uint32_t major = 0;
  std::uint32_t minor = 0;

  /// SMBIOS marks a firmware without a release number this way.
  [[nodiscard]] bool isAbsent() const { return major == 255 && minor == 255; }
};

/// "5.17"; each part is one byte.
std::optional<ReleaseNumbers> parseBiosRelease(std::string_view text);

/// "31007.2"; each part is a number of any size that has 32 bits.
std::optional<ReleaseNumbers> parseMajorMinor(std::string_view text);

}  // namespace agent::discovery
