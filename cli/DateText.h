// CIM datetimes for people.
#pragma once

#include <optional>
#include <string>
#include <string_view>

namespace cli {

/// The date of a CIM datetime: "2010-12-31", with the time and the distance from UTC in hours and minutes
/// where the time is not midnight ("2010-12-31 14:05:06 +01:00"). Nothing for an interval, a text with
/// wildcards, or one that is no date of the calendar.
std::optional<std::string> readableDate(std::string_view dateTime);

}  // namespace cli
