#include <agent/discovery/dmi/DmiValues.h>

#include <algorithm>
#include <array>
#include <charconv>
#include <cstddef>

namespace agent::discovery {

namespace {

bool isDigit(char c) {
  return c >= '0' && c <= '9';
}

/// The number that all of `text` is; nothing where it is empty, longer than `digits`, above 32 bits or holds
/// anything but digits.
std::optional<std::uint32_t> wholeNumber(std::string_view text, std::size_t digits) {
  if (text.empty() || text.size() > digits || !std::all_of(text.begin(), text.end(), isDigit)) {
    return std::nullopt;
  }
  std::uint32_t number = 0;
  if (std::from_chars(text.data(), text.data() + text.size(), number).ec != std::errc()) {
    return std::nullopt;
  }
  return number;
}

/// Cuts `text` at the first `separator`: gives what stands before it and leaves the rest.
std::string_view cut(std::string_view& text, char separator) {
  const std::size_t end = std::min(text.find(separator), text.size());
  const std::string_view before = text.substr(0, end);
  text.remove_prefix(std::min(end + 1, text.size()));
  return before;
}

std::uint32_t daysOf(std::uint32_t month, std::uint32_t year) {
  static constexpr std::array<std::uint32_t, 12> days = {31, 28, 31, 30, 31, 30, 31, 31, 30, 31, 30, 31};
  const bool leap = (year % 4 == 0 && year % 100 != 0) || year % 400 == 0;
  return month == 2 && leap ? 29 : days[month - 1];
}

std::string padded(std::uint32_t number, std::size_t width) {
  std::string text = std::to_string(number);
  return std::string(width - std::min(width, text.size()), '0') + text;
}

std::optional<std::string> dateText(std::uint32_t month, std::uint32_t day, std::uint32_t year) {
  if (year == 0 || month < 1 || month > 12 || day < 1 || day > daysOf(month, year)) {
    return std::nullopt;
  }
  return padded(month, 2) + "/" + padded(day, 2) + "/" + padded(year, 4);
}

/// Year, month and day, with "-" between or nothing, and perhaps a time of the day behind them.
std::optional<std::string> parseIsoDate(std::string_view text) {
  static constexpr std::string_view timeCharacters = "0123456789:.+-Zz";
  const bool hasDashes = text.size() > 4 && text[4] == '-';
  const std::size_t length = hasDashes ? 10 : 8;
  if (text.size() < length || (hasDashes && text[7] != '-')) {
    return std::nullopt;
  }
  const std::string_view time = text.substr(length);
  const bool isTime = time.size() > 1 && (time[0] == 'T' || time[0] == 't' || time[0] == ' ') &&
                      isDigit(time[1]) && time.find_first_not_of(timeCharacters, 1) == std::string_view::npos;
  if (!time.empty() && !isTime) {
    return std::nullopt;
  }
  const auto year = wholeNumber(text.substr(0, 4), 4);
  const auto month = wholeNumber(text.substr(hasDashes ? 5 : 4, 2), 2);
  const auto day = wholeNumber(text.substr(hasDashes ? 8 : 6, 2), 2);
  return year && month && day ? dateText(*month, *day, *year) : std::nullopt;
}

std::optional<ReleaseNumbers> parseNumbers(std::string_view text, std::size_t digits, std::uint32_t highest) {
  const auto major = wholeNumber(cut(text, '.'), digits);
  const auto minor = wholeNumber(text, digits);
  if (!major || !minor || *major > highest || *minor > highest) {
    return std::nullopt;
  }
  return ReleaseNumbers{*major, *minor};
}

}  // namespace

std::optional<std::string> parseBiosDate(std::string_view text) {
  const auto month = wholeNumber(cut(text, '/'), 2);
  const auto day = wholeNumber(cut(text, '/'), 2);
  const auto year = wholeNumber(text, 4);
  if (!month || !day || !year || (text.size() != 2 && text.size() != 4)) {
    return std::nullopt;
  }
  return dateText(*month, *day, text.size() == 2 ? 1900 + *year : *year);
}

std::optional<std::string> parseFirmwareDate(std::string_view text) {
  std::optional<std::string> date = parseBiosDate(text);
  return date ? date : parseIsoDate(text);
}

bool isUnset(std::string_view text) {
  return text.find('0') != std::string_view::npos &&
         text.find_first_not_of("0-/:.+TZ{} ") == std::string_view::npos;
}

std::optional<ReleaseNumbers> parseBiosRelease(std::string_view text) {
  return parseNumbers(text, 3, 0xff);
}

std::optional<ReleaseNumbers> parseMajorMinor(std::string_view text) {
  return parseNumbers(text, 10, 0xffffffff);
}

}  // namespace agent::discovery
