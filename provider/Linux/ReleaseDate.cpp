#include "Linux/ReleaseDate.h"

#include <cstddef>
#include <cstring>

namespace Oru::SoftwareInventoryProfileProvider {

namespace {

constexpr bool isSpace(char character) {
  return character == ' ' || (character >= '\t' && character <= '\r');
}

/// Scans one unsigned number of at most `width` characters, sign included, as "%u" with that width does.
bool scanNumber(std::string_view& rest, std::size_t width, unsigned int& number) {
  while (!rest.empty() && isSpace(rest.front())) {
    rest.remove_prefix(1);
  }
  const bool negative = !rest.empty() && rest.front() == '-';
  if (negative || (!rest.empty() && rest.front() == '+')) {
    rest.remove_prefix(1);
    --width;
  }
  unsigned int value = 0;
  std::size_t digits = 0;
  while (digits < width && digits < rest.size() && rest[digits] >= '0' && rest[digits] <= '9') {
    value = value * 10 + static_cast<unsigned int>(rest[digits] - '0');
    ++digits;
  }
  if (digits == 0) {
    return false;
  }
  rest.remove_prefix(digits);
  number = negative ? 0 - value : value;
  return true;
}

bool scanSlash(std::string_view& rest) {
  if (rest.empty() || rest.front() != '/') {
    return false;
  }
  rest.remove_prefix(1);
  return true;
}

/// Writes the fields of a date one after the other, with room for the longest that each can be.
class FieldWriter {
 public:
  void append(std::string_view text) {
    std::memcpy(end_, text.data(), text.size());
    end_ += text.size();
  }

  /// A number of at least `width` characters, padded on the left.
  void append(unsigned int number, std::size_t width, char padding) {
    std::size_t length = 1;
    for (unsigned int rest = number / 10; rest != 0; rest /= 10) {
      ++length;
    }
    for (; length < width; --width) {
      *end_++ = padding;
    }
    end_ += length;
    char* at = end_;
    for (; length != 0; --length) {
      *--at = static_cast<char>('0' + number % 10);
      number /= 10;
    }
  }

  [[nodiscard]] std::string_view view() const { return {text_, static_cast<std::size_t>(end_ - text_)}; }

 private:
  char text_[64];  // four numbers of up to 10 digits, and 15 characters between them
  char* end_ = text_;
};

constexpr bool isDigit(char character) {
  return character >= '0' && character <= '9';
}

/// Is this a date as nearly all are, "12/31/2010"?
bool isPlain(std::string_view text) {
  constexpr std::string_view pattern = "00/00/0000";
  return text.size() == pattern.size() && text[2] == '/' && text[5] == '/' && isDigit(text[0]) &&
         isDigit(text[1]) && isDigit(text[3]) && isDigit(text[4]) && isDigit(text[6]) && isDigit(text[7]) &&
         isDigit(text[8]) && isDigit(text[9]);
}

constexpr unsigned int twoDigits(const char* at) {
  return static_cast<unsigned int>(at[0] - '0') * 10 + static_cast<unsigned int>(at[1] - '0');
}

constexpr void putTwoDigits(char* at, unsigned int number) {
  at[0] = static_cast<char>('0' + number / 10);
  at[1] = static_cast<char>('0' + number % 10);
}

}  // namespace

MonthDayYear scanDate(std::string_view text) {
  if (isPlain(text)) {
    return {twoDigits(text.data()), twoDigits(text.data() + 3),
            twoDigits(text.data() + 6) * 100 + twoDigits(text.data() + 8)};
  }
  // A C string ends at its first NUL.
  std::string_view rest = text.substr(0, text.find('\0'));
  MonthDayYear date;
  static_cast<void>(scanNumber(rest, 2, date.month) && scanSlash(rest) && scanNumber(rest, 2, date.day) &&
                    scanSlash(rest) && scanNumber(rest, 4, date.year));
  return date;
}

std::size_t formatDate(MonthDayYear date, long secondsWest, DateBuffer& buffer) {
  const bool east = secondsWest < 0;
  const long minutes = east ? -(secondsWest / 60) : secondsWest / 60;
  // Where every field fills its width, as nearly always, digits go straight into their places.
  if (date.year >= 1000 && date.year <= 9999 && date.month <= 99 && date.day <= 99 && minutes <= 999) {
    constexpr std::string_view pattern = "yyyymmdd000000.000000+mmm";
    std::memcpy(buffer.data(), pattern.data(), pattern.size() + 1);
    putTwoDigits(&buffer[0], date.year / 100);
    putTwoDigits(&buffer[2], date.year % 100);
    putTwoDigits(&buffer[4], date.month);
    putTwoDigits(&buffer[6], date.day);
    buffer[21] = east ? '-' : '+';
    buffer[22] = static_cast<char>('0' + minutes / 100);
    putTwoDigits(&buffer[23], static_cast<unsigned int>(minutes % 100));
    return pattern.size();
  }
  FieldWriter text;
  text.append(date.year, 4, ' ');
  text.append(date.month, 2, '0');
  text.append(date.day, 2, '0');
  text.append("000000.000000");
  text.append(east ? "-" : "+");
  text.append(static_cast<unsigned int>(minutes), 3, '0');

  const std::string_view fitting = text.view().substr(0, buffer.size() - 1);
  std::memcpy(buffer.data(), fitting.data(), fitting.size());
  buffer[fitting.size()] = '\0';
  return fitting.size();
}

std::string_view DateFormatter::format(const std::string& text, long secondsWest) {
  if (length_ == 0 || secondsWest != secondsWest_ || text != text_) {
    text_ = text;
    secondsWest_ = secondsWest;
    length_ = formatDate(scanDate(text), secondsWest, buffer_);
  }
  return {buffer_.data(), length_};
}

}  // namespace Oru::SoftwareInventoryProfileProvider
