#include <agent/discovery/dmi/DmiValues.h>

#include <algorithm>
#include <array>
#include <charconv>
#include <cstddef>

namespace agent::discovery {

namespace {

/// The number that all of `text` is; nothing where it is empty, longer than `digits` or holds anything but
/// digits.
std::optional<std::uint32_t> wholeNumber(std::string_view text, std::size_t digits) {
  const auto isDigit = [](char c) { return c >= '0' && c <= '9'; };
  if (text.empty() || text.size() > digits || !std::all_of(text.begin(), text.end(), isDigit)) {
    return std::nullopt;
  }
  std::uint32_t number = 0;
  std::from_chars(text.data(), text.data() + text.size(), number);
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

}  // namespace

std::optional<std::string> parseBiosDate(std::string_view text) {
  const auto month = wholeNumber(cut(text, '/'), 2);
  const auto day = wholeNumber(cut(text, '/'), 2);
  const auto year = wholeNumber(text, 4);
  if (!month || !day || !year || (text.size() != 2 && text.size() != 4)) {
    return std::nullopt;
  }
  const std::uint32_t fullYear = text.size() == 2 ? 1900 + *year : *year;
  if (fullYear == 0 || *month < 1 || *month > 12 || *day < 1 || *day > daysOf(*month, fullYear)) {
    return std::nullopt;
  }
  return padded(*month, 2) + "/" + padded(*day, 2) + "/" + padded(fullYear, 4);
}

std::optional<BiosRelease> parseBiosRelease(std::string_view text) {
  static constexpr std::uint32_t highest = 255;
  const auto major = wholeNumber(cut(text, '.'), 3);
  const auto minor = wholeNumber(text, 3);
  if (!major || !minor || *major > highest || *minor > highest) {
    return std::nullopt;
  }
  return BiosRelease{*major, *minor};
}

}  // namespace agent::discovery
