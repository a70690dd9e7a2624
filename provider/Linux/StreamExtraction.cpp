#include "Linux/StreamExtraction.h"

#include <array>
#include <limits>

namespace Oru::SoftwareInventoryProfileProvider {

namespace {

constexpr unsigned char noDigit = 16;

/// The value of each character as a digit, `noDigit` where it is none.
constexpr std::array<unsigned char, 256> digitValues = [] {
  std::array<unsigned char, 256> values{};
  values.fill(noDigit);
  for (unsigned char i = 0; i < 10; ++i) {
    values['0' + i] = i;
  }
  for (unsigned char i = 0; i < 6; ++i) {
    values['a' + i] = values['A' + i] = static_cast<unsigned char>(10 + i);
  }
  return values;
}();

constexpr unsigned int digitValue(char character) {
  return digitValues[static_cast<unsigned char>(character)];
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
  const char* const begin = rest_.data();
  const char* const end = begin + rest_.size();
  const char* at = begin;
  std::uint64_t value = 0;
  bool overflow = false;
  for (; at != end; ++at) {
    const unsigned int digit = digitValue(*at);
    if (digit >= base) {
      break;
    }
    overflow = overflow || value > max / base || value * base > max - digit;
    value = value * base + digit;
  }
  const bool anyDigit = at != begin;
  rest_.remove_prefix(static_cast<std::size_t>(at - begin));
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
