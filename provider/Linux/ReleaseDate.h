// Turns a release date as the instrumentation has it into the text of a CIM datetime.
#pragma once

#include <array>
#include <cstddef>
#include <string>
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

/// Formats dates as the instrumentation has them, one after the other; the same date twice in a row is
/// formatted once.
class DateFormatter {
 public:
  /// The CIM datetime of a month/day/year text. It lives until the next call.
  std::string_view format(const std::string& text, long secondsWest);

 private:
  std::string text_;
  long secondsWest_ = 0;
  DateBuffer buffer_{};
  std::size_t length_ = 0;
};

}  // namespace Oru::SoftwareInventoryProfileProvider
