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

}  // namespace

MonthDayYear scanDate(std::string_view text) {
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
