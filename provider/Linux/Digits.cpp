#include "Linux/Digits.h"

#include <bit>
#include <cstring>

namespace Oru::SoftwareInventoryProfileProvider {

namespace {

/// A word with `byte` in each of its eight bytes. Words hold eight characters, the first in the least
/// significant byte.
constexpr std::uint64_t inEachByte(unsigned char byte) {
  return byte * std::uint64_t{0x0101010101010101};
}

constexpr std::uint64_t highBits = inEachByte(0x80);

constexpr std::uint64_t firstCharacterLowest(std::uint64_t word) {
  return std::endian::native == std::endian::big ? __builtin_bswap64(word) : word;
}

std::uint64_t load(const char* characters) {
  std::uint64_t word = 0;
  std::memcpy(&word, characters, sizeof word);
  return firstCharacterLowest(word);
}

void store(char* characters, std::uint64_t word) {
  word = firstCharacterLowest(word);
  std::memcpy(characters, &word, sizeof word);
}

/// The value of a hexadecimal digit; above 15 for any other character.
constexpr unsigned int valueOf(unsigned char character) {
  const unsigned int decimal = character - unsigned{'0'};
  if (decimal < 10) {
    return decimal;
  }
  const unsigned int letter = (character | 0x20U) - unsigned{'a'};
  return letter < 6 ? letter + 10 : 16;
}

/// The high bit of each byte that lies in [first, last]. All must be below 0x80, so that no sum carries into
/// the next byte.
constexpr std::uint64_t inRange(std::uint64_t word, unsigned char first, unsigned char last) {
  return (word + inEachByte(static_cast<unsigned char>(0x80 - first))) &
         ~(word + inEachByte(static_cast<unsigned char>(0x7f - last))) & highBits;
}

constexpr bool areHexadecimal(std::uint64_t word) {
  if ((word & highBits) != 0) {
    return false;
  }
  return (inRange(word, '0', '9') | inRange(word | inEachByte(0x20), 'a', 'f')) == highBits;
}

/// The number of eight characters that are hexadecimal digits.
constexpr std::uint64_t hexadecimalNumber(std::uint64_t word) {
  // Letters, which alone have bit 6, count on from 9 in their low bits.
  const std::uint64_t letters = (word >> 6U) & inEachByte(1);
  std::uint64_t digits = __builtin_bswap64((word & inEachByte(0x0f)) + letters * 9);
  digits = (digits | (digits >> 4U)) & 0x00FF00FF00FF00FFU;
  digits = (digits | (digits >> 8U)) & 0x0000FFFF0000FFFFU;
  return (digits | (digits >> 16U)) & 0xFFFFFFFFU;
}

/// The digits of two numbers below 10^4, the first of which is in the lower half. They are halved into twos
/// and ones, all halves of a step at once; the divisions by 100 and 10 are multiplications that are exact for
/// what a half can be.
constexpr std::uint64_t decimalDigitsOfFours(std::uint64_t fours) {
  const std::uint64_t hundreds = ((fours * 10486) >> 20U) & 0x0000007F0000007FU;
  const std::uint64_t twos = hundreds | ((fours - hundreds * 100) << 16U);
  const std::uint64_t tens = ((twos * 103) >> 10U) & 0x000F000F000F000FU;
  return (tens | ((twos - tens * 10) << 8U)) + inEachByte('0');
}

/// The eight decimal digits of a number below 10^8.
constexpr std::uint64_t decimalDigits(std::uint64_t number) {
  const std::uint64_t upper = number / 10000;
  return decimalDigitsOfFours(upper | ((number - upper * 10000) << 32U));
}

}  // namespace

std::optional<std::uint64_t> numberOfHexadecimalDigits(std::string_view text) {
  if (text.empty() || text.size() > 16) {
    return std::nullopt;
  }
  if (text.size() < 8) {
    std::uint64_t number = 0;
    for (const char character : text) {
      const unsigned int digit = valueOf(static_cast<unsigned char>(character));
      if (digit > 15) {
        return std::nullopt;
      }
      number = number << 4U | digit;
    }
    return number;
  }
  // Where the first eight and the last eight digits overlap, they are the same.
  const std::uint64_t first = load(text.data());
  const std::uint64_t last = load(text.data() + text.size() - 8);
  if (!areHexadecimal(first) || !areHexadecimal(last)) {
    return std::nullopt;
  }
  return (hexadecimalNumber(first) << (4 * (text.size() - 8))) | hexadecimalNumber(last);
}

void DecimalText::set(std::uint64_t number, char last) {
  constexpr std::uint64_t eightDigits = 100'000'000;
  const std::uint64_t end = static_cast<unsigned char>(last);
  const std::uint64_t upper = number / eightDigits;
  const std::uint64_t lowestDigits = decimalDigits(number - upper * eightDigits);
  if (upper == 0) {
    keep(lowestDigits, end, 0, 0);
  } else {
    const std::uint64_t top = upper / eightDigits;  // below 10^4
    const std::uint64_t middleDigits = decimalDigits(upper - top * eightDigits);
    if (top == 0) {
      keep(middleDigits, lowestDigits, end, 0);
      length_ += 8;
    } else {
      keep(decimalDigitsOfFours(top << 32U), middleDigits, lowestDigits, end);
      length_ += 16;
    }
  }
  length_ -= last == '\0' ? 1 : 0;
}

/// Keeps the characters of four words without the zeros that the first begins with; its last digit stays,
/// because 0 has a digit, too. The length is what is left of the first, and the character behind all digits.
[[gnu::always_inline]] inline void DecimalText::keep(std::uint64_t first, std::uint64_t second,
                                                     std::uint64_t third, std::uint64_t fourth) {
  const std::uint64_t values = (first - inEachByte('0')) | (std::uint64_t{1} << 56U);
  const auto zeros = static_cast<unsigned int>(std::countr_zero(values)) / 8;
  const unsigned int shift = zeros * 8;
  const unsigned int rest = 63 - shift;
  store(characters_.data(), (first >> shift) | (second << 1U << rest));
  store(characters_.data() + 8, (second >> shift) | (third << 1U << rest));
  store(characters_.data() + 16, (third >> shift) | (fourth << 1U << rest));
  length_ = 9 - zeros;
}

}  // namespace Oru::SoftwareInventoryProfileProvider
