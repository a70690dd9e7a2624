// Turns a release date as the instrumentation has it into the text of a CIM datetime.
#pragma once

#include <array>
#include <string_view>

namespace Oru::SoftwareInventoryProfileProvider {

/// Room for a CIM datetime of 25 characters and its end.
using DateBuffer = std::array<char, 26>;

/// Month, day and year of a text, scanned as the C library scans "%02u/%02u/%04u": fields that do not scan
/// stay 0.
struct MonthDayYear {
  unsigned int month = 0;
  unsigned int day = 0;
  unsigned int year = 0;
};
MonthDayYear scanDate(std::string_view text);

/// Fills `buffer` as "%4u%02u%02u000000.000000%1c%03u" prints year, month, day, sign and minutes, cut to the
/// room there is. `secondsWest` is the C library's `timezone`; sign and minutes follow it as it stands, west
/// of UTC positive. Returns the number of characters.
std::size_t formatDate(MonthDayYear date, long secondsWest, DateBuffer& buffer);

}  // namespace Oru::SoftwareInventoryProfileProvider
