#include <cli/DateText.h>

#include <array>
#include <chrono>
#include <cstdio>

namespace cli {
namespace {

/// The number in `text`, or nothing where a character is no digit.
std::optional<unsigned> digits(std::string_view text) {
  unsigned number = 0;
  for (const char c : text) {
    if (c < '0' || c > '9') {
      return std::nullopt;
    }
    number = number * 10 + static_cast<unsigned>(c - '0');
  }
  return number;
}

/// "+060", minutes from UTC, as " +01:00".
std::string readableOffset(char sign, unsigned minutes) {
  std::array<char, 16> text{};
  const int length =
      std::snprintf(text.data(), text.size(), " %c%02u:%02u", sign, minutes / 60, minutes % 60);
  return {text.data(), static_cast<std::size_t>(length)};
}

}  // namespace

std::optional<std::string> readableDate(std::string_view dateTime) {
  // yyyymmddhhmmss.mmmmmmsutc
  if (dateTime.size() != 25 || dateTime[14] != '.' || (dateTime[21] != '+' && dateTime[21] != '-')) {
    return std::nullopt;
  }
  const auto year = digits(dateTime.substr(0, 4));
  const auto month = digits(dateTime.substr(4, 2));
  const auto day = digits(dateTime.substr(6, 2));
  const auto time = digits(dateTime.substr(8, 6));
  const auto microseconds = digits(dateTime.substr(15, 6));
  const auto offset = digits(dateTime.substr(22, 3));
  if (!year || !month || !day || !time || !microseconds || !offset) {
    return std::nullopt;
  }
  const std::chrono::year_month_day date{std::chrono::year(static_cast<int>(*year)),
                                         std::chrono::month(*month), std::chrono::day(*day)};
  const bool isTime = *time / 10000 < 24 && *time / 100 % 100 < 60 && *time % 100 < 60;
  if (!date.ok() || !isTime) {
    return std::nullopt;
  }
  std::string text;
  text.append(dateTime.substr(0, 4)).append("-").append(dateTime.substr(4, 2)).append("-");
  text.append(dateTime.substr(6, 2));
  if (*time != 0 || *microseconds != 0) {
    text.append(" ").append(dateTime.substr(8, 2)).append(":").append(dateTime.substr(10, 2)).append(":");
    text.append(dateTime.substr(12, 2)).append(readableOffset(dateTime[21], *offset));
  }
  return text;
}

}  // namespace cli
