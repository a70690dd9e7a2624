// CIM datetimes (DSP0004): 25 characters, "yyyymmddhhmmss.mmmmmmsutc" for a point in time and
// "ddddddddhhmmss.mmmmmm:000" for an interval. Asterisks stand for what is not known, from the right: whole
// fields, or single digits of the microseconds.
#pragma once

#include <cstdint>
#include <optional>
#include <string_view>

namespace cimom {

/// Whether every character is as the form wants it, and every field a possible one.
[[nodiscard]] bool isDateTimeText(std::string_view text);

/// Of a valid text: microseconds of the interval, or since 1970-01-01T00:00Z; none before that. Asterisks
/// count as the lowest value of their field.
[[nodiscard]] std::optional<std::uint64_t> microsecondsOf(std::string_view text);

/// Writes 25 characters; false where they cannot hold the value (years beyond 9999, 10^8 days and more).
/// Points in time are written in UTC.
[[nodiscard]] bool writeDateTime(std::uint64_t microseconds, bool isInterval, char* text);

}  // namespace cimom
