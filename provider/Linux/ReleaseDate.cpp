#include "Linux/ReleaseDate.h"

#include <charconv>
#include <cstddef>

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

/// Appends to a buffer, keeping one character for the end.
class BoundedText {
 public:
  explicit BoundedText(DateBuffer& buffer) : buffer_(buffer) { buffer_.fill('\0'); }

  void append(std::string_view text) {
    for (const char character : text) {
      if (length_ + 1 < buffer_.size()) {
        buffer_[length_++] = character;
      }
    }
  }

  /// A number of at least `width` characters, padded on the left.
  void append(unsigned int number, std::size_t width, char padding) {
    std::array<char, 10> digits{};
    const char* end = std::to_chars(digits.data(), digits.data() + digits.size(), number).ptr;
    const std::string_view text(digits.data(), static_cast<std::size_t>(end - digits.data()));
    for (std::size_t i = text.size(); i < width; ++i) {
      append(std::string_view(&padding, 1));
    }
    append(text);
  }

  [[nodiscard]] std::size_t length() const { return length_; }

 private:
  DateBuffer& buffer_;
  std::size_t length_ = 0;
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
  BoundedText text(buffer);
  text.append(date.year, 4, ' ');
  text.append(date.month, 2, '0');
  text.append(date.day, 2, '0');
  text.append("000000.000000");
  text.append(east ? "-" : "+");
  text.append(static_cast<unsigned int>(minutes), 3, '0');
  return text.length();
}

}  // namespace Oru::SoftwareInventoryProfileProvider
