#include <cimom/broker/DateTimeText.h>

#include <algorithm>
#include <array>
#include <chrono>
#include <cstddef>

namespace cimom {

namespace {

constexpr std::size_t textSize = 25;
constexpr std::size_t fractionStart = 15;
constexpr std::size_t fractionSize = 6;
constexpr std::size_t signPosition = 21;
constexpr std::uint64_t perSecond = 1000000;
constexpr std::uint64_t perDay = 86400 * perSecond;

struct Field {
  std::size_t start;
  std::size_t size;
  unsigned lowest;
  unsigned highest;
};

constexpr std::array<Field, 6> timeFields = {
    {{0, 4, 0, 9999}, {4, 2, 1, 12}, {6, 2, 1, 31}, {8, 2, 0, 23}, {10, 2, 0, 59}, {12, 2, 0, 59}}};
constexpr std::array<Field, 4> intervalFields = {
    {{0, 8, 0, 99999999}, {8, 2, 0, 23}, {10, 2, 0, 59}, {12, 2, 0, 59}}};

bool isDigit(char character) {
  return character >= '0' && character <= '9';
}
bool allDigits(std::string_view text) {
  return std::all_of(text.begin(), text.end(), isDigit);
}
bool allAsterisks(std::string_view text) {
  return text.find_first_not_of('*') == std::string_view::npos;
}

unsigned number(std::string_view digits) {
  unsigned value = 0;
  for (const char digit : digits) {
    value = value * 10 + static_cast<unsigned>(digit - '0');
  }
  return value;
}

// The field's value, or its lowest one where it is not known.
unsigned valueOf(std::string_view text, const Field& field) {
  const std::string_view digits = text.substr(field.start, field.size);
  return allDigits(digits) ? number(digits) : field.lowest;
}

// The first field must be known: a datetime of asterisks alone says nothing.
template <std::size_t Count>
bool fieldsAreValid(std::string_view text, const std::array<Field, Count>& fields) {
  bool known = true;
  for (const Field& field : fields) {
    const std::string_view digits = text.substr(field.start, field.size);
    if (known && allDigits(digits)) {
      if (number(digits) < field.lowest || number(digits) > field.highest) {
        return false;
      }
    } else if (field.start > 0 && allAsterisks(digits)) {
      known = false;
    } else {
      return false;
    }
  }
  const std::string_view fraction = text.substr(fractionStart, fractionSize);
  const std::size_t digits = std::min(fraction.find('*'), fractionSize);
  return allDigits(fraction.substr(0, digits)) && allAsterisks(fraction.substr(digits)) &&
         (known || digits == 0);
}

std::chrono::year_month_day dateOf(std::string_view text) {
  return {std::chrono::year(static_cast<int>(valueOf(text, timeFields[0]))),
          std::chrono::month(valueOf(text, timeFields[1])), std::chrono::day(valueOf(text, timeFields[2]))};
}

std::uint64_t fractionOf(std::string_view text) {
  std::uint64_t value = 0;
  for (const char digit : text.substr(fractionStart, fractionSize)) {
    value = value * 10 + (isDigit(digit) ? static_cast<std::uint64_t>(digit - '0') : 0);
  }
  return value;
}

// Hours, minutes, seconds and their fraction; the two forms have them in the same place.
std::uint64_t timeOfDay(std::string_view text) {
  const std::uint64_t seconds = (valueOf(text, timeFields[3]) * 60ULL + valueOf(text, timeFields[4])) * 60 +
                                valueOf(text, timeFields[5]);
  return seconds * perSecond + fractionOf(text);
}

void writeNumber(char* text, std::size_t size, std::uint64_t value) {
  for (std::size_t position = size; position > 0; --position) {
    text[position - 1] = static_cast<char>('0' + value % 10);
    value /= 10;
  }
}

}  // namespace

bool isDateTimeText(std::string_view text) {
  if (text.size() != textSize || text[fractionStart - 1] != '.') {
    return false;
  }
  const std::string_view offset = text.substr(signPosition + 1);
  if (text[signPosition] == ':') {
    return offset == "000" && fieldsAreValid(text, intervalFields);
  }
  const bool isTime = text[signPosition] == '+' || text[signPosition] == '-';
  return isTime && allDigits(offset) && fieldsAreValid(text, timeFields) && dateOf(text).ok();
}

std::optional<std::uint64_t> microsecondsOf(std::string_view text) {
  if (text[signPosition] == ':') {
    return valueOf(text, intervalFields[0]) * perDay + timeOfDay(text);
  }
  const std::chrono::sys_days day = dateOf(text);
  const auto minutes = static_cast<std::int64_t>(number(text.substr(signPosition + 1)));
  const std::int64_t east = text[signPosition] == '+' ? minutes : -minutes;
  const std::int64_t total = day.time_since_epoch().count() * static_cast<std::int64_t>(perDay) +
                             static_cast<std::int64_t>(timeOfDay(text)) -
                             east * 60 * static_cast<std::int64_t>(perSecond);
  return total < 0 ? std::nullopt : std::optional(static_cast<std::uint64_t>(total));
}

bool writeDateTime(std::uint64_t microseconds, bool isInterval, char* text) {
  constexpr std::uint64_t daysOfTimes = 2932897;  // 1970-01-01 to 9999-12-31
  const std::uint64_t days = microseconds / perDay;
  if (days >= (isInterval ? std::uint64_t{100000000} : daysOfTimes)) {
    return false;
  }
  const std::uint64_t seconds = microseconds % perDay / perSecond;
  if (isInterval) {
    writeNumber(text, 8, days);
  } else {
    const std::chrono::year_month_day date{
        std::chrono::sys_days(std::chrono::days(static_cast<std::int64_t>(days)))};
    writeNumber(text, 4, static_cast<std::uint64_t>(static_cast<int>(date.year())));
    writeNumber(text + 4, 2, static_cast<unsigned>(date.month()));
    writeNumber(text + 6, 2, static_cast<unsigned>(date.day()));
  }
  writeNumber(text + 8, 2, seconds / 3600);
  writeNumber(text + 10, 2, seconds / 60 % 60);
  writeNumber(text + 12, 2, seconds % 60);
  text[fractionStart - 1] = '.';
  writeNumber(text + fractionStart, fractionSize, microseconds % perSecond);
  text[signPosition] = isInterval ? ':' : '+';
  writeNumber(text + signPosition + 1, 3, 0);
  return true;
}

}  // namespace cimom
