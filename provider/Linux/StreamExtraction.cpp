#include "Linux/StreamExtraction.h"

#include <limits>

namespace Oru::SoftwareInventoryProfileProvider {

namespace {

constexpr unsigned int noDigit = 16;

constexpr unsigned int digitValue(char character) {
  if (character >= '0' && character <= '9') {
    return static_cast<unsigned int>(character - '0');
  }
  if (character >= 'a' && character <= 'f') {
    return static_cast<unsigned int>(character - 'a') + 10;
  }
  if (character >= 'A' && character <= 'F') {
    return static_cast<unsigned int>(character - 'A') + 10;
  }
  return noDigit;
}

constexpr bool isWhiteSpace(char character) {
  return character == ' ' || (character >= '\t' && character <= '\r');
}

}  // namespace

bool StreamExtraction::skipWhiteSpace() {
  while (!rest_.empty() && isWhiteSpace(rest_.front())) {
    rest_.remove_prefix(1);
  }
  failed_ = failed_ || rest_.empty();
  return !failed_;
}

// The prefix is taken even where no digit follows: such a text has no number at all.
template <unsigned int base>
void StreamExtraction::skipPrefix() {
  if (base == 16 && rest_.size() >= 2 && rest_[0] == '0' && (rest_[1] == 'x' || rest_[1] == 'X')) {
    rest_.remove_prefix(2);
  }
}

template <unsigned int base>
std::uint64_t StreamExtraction::number() {
  if (!skipWhiteSpace()) {
    return 0;
  }
  const bool negative = rest_.front() == '-';
  if (negative || rest_.front() == '+') {
    rest_.remove_prefix(1);
  }
  skipPrefix<base>();

  constexpr std::uint64_t max = std::numeric_limits<std::uint64_t>::max();
  std::uint64_t value = 0;
  bool anyDigit = false;
  bool overflow = false;
  for (; !rest_.empty(); rest_.remove_prefix(1)) {
    const unsigned int digit = digitValue(rest_.front());
    if (digit >= base) {
      break;
    }
    anyDigit = true;
    overflow = overflow || value > (max - digit) / base;
    value = value * base + digit;
  }
  failed_ = !anyDigit || overflow;
  if (overflow) {
    return max;
  }
  return negative ? 0 - value : value;
}

template std::uint64_t StreamExtraction::number<10>();
template std::uint64_t StreamExtraction::number<16>();

char StreamExtraction::character() {
  if (!skipWhiteSpace()) {
    return '\0';
  }
  const char first = rest_.front();
  rest_.remove_prefix(1);
  return first;
}

std::string_view StreamExtraction::word() {
  if (!skipWhiteSpace()) {
    return {};
  }
  std::size_t length = 0;
  while (length < rest_.size() && !isWhiteSpace(rest_[length])) {
    ++length;
  }
  const std::string_view found = rest_.substr(0, length);
  rest_.remove_prefix(length);
  return found;
}

}  // namespace Oru::SoftwareInventoryProfileProvider
