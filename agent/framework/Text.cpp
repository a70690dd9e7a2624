#include <agent/framework/Mix.h>
#include <agent/framework/NodeTree.h>

#include <array>
#include <bit>
#include <charconv>
#include <cstring>

namespace agent {
namespace {

constexpr unsigned char asByte(char character) {
  return static_cast<unsigned char>(character);
}

constexpr std::string_view replacementCharacter = "\xEF\xBF\xBD";

/// A character at the start of a text: how many bytes it takes, and what it is.
struct Character {
  std::size_t length = 1;
  bool isValid = true;
  bool isControl = false;
};

constexpr bool isContinuation(unsigned char byte) {
  return (byte & 0xC0U) == 0x80U;
}

/// Length of the sequence that a first byte announces, and the bounds of its second byte, which keep out
/// overlong forms, surrogates and what lies beyond U+10FFFF. Length 0: no sequence starts so.
struct Sequence {
  std::size_t length = 0;
  unsigned char secondFrom = 0x80;
  unsigned char secondTo = 0xBF;
};

constexpr Sequence sequenceOf(unsigned char first) {
  if (first >= 0xC2 && first <= 0xDF) {
    return {2};
  }
  if (first >= 0xE0 && first <= 0xEF) {
    return {3, static_cast<unsigned char>(first == 0xE0 ? 0xA0 : 0x80),
            static_cast<unsigned char>(first == 0xED ? 0x9F : 0xBF)};
  }
  if (first >= 0xF0 && first <= 0xF4) {
    return {4, static_cast<unsigned char>(first == 0xF0 ? 0x90 : 0x80),
            static_cast<unsigned char>(first == 0xF4 ? 0x8F : 0xBF)};
  }
  return {};
}

Character firstCharacter(std::string_view text) {
  const unsigned char first = asByte(text.front());
  if (first < 0x80) {
    return {1, true, first < 0x20 || first == 0x7F};
  }
  const Sequence sequence = sequenceOf(first);
  if (sequence.length == 0 || text.size() < sequence.length) {
    return {1, false, false};
  }
  const unsigned char second = asByte(text[1]);
  if (second < sequence.secondFrom || second > sequence.secondTo) {
    return {1, false, false};
  }
  for (std::size_t i = 2; i < sequence.length; ++i) {
    if (!isContinuation(asByte(text[i]))) {
      return {1, false, false};
    }
  }
  // U+FFFE and U+FFFF are no characters, and stand in no XML.
  if (first == 0xEF && second == 0xBF && asByte(text[2]) >= 0xBE) {
    return {sequence.length, false, false};
  }
  // U+0080 to U+009F are control characters too.
  return {sequence.length, true, first == 0xC2 && second < 0xA0};
}

/// Is this a text that most are: printable ASCII without blanks at its ends?
bool isPlain(std::string_view text) {
  // Without a way out of the loop, so that it takes many characters at a time.
  unsigned int isOther = 0;
  for (const char character : text) {
    isOther |= static_cast<unsigned char>(asByte(character) - 0x20U) > 0x7E - 0x20 ? 1U : 0U;
  }
  return isOther == 0 && (text.empty() || (text.front() != ' ' && text.back() != ' '));
}

void trimEnd(std::string& text) {
  while (!text.empty() && text.back() == ' ') {
    text.pop_back();
  }
}

/// The eight hexadecimal digits of a 32-bit number, the first digit in the least significant byte.
constexpr std::uint64_t eightDigits(std::uint64_t number) {
  number = (number | (number << 16U)) & 0x0000FFFF0000FFFFU;
  number = (number | (number << 8U)) & 0x00FF00FF00FF00FFU;
  number = (number | (number << 4U)) & 0x0F0F0F0F0F0F0F0FU;
  // A nibble above 9 carries into its upper half when 6 is added; it is then moved from ':' on to 'a' on.
  const std::uint64_t letters = ((number + 0x0606060606060606U) >> 4U) & 0x0101010101010101U;
  const std::uint64_t digits = number + 0x3030303030303030U + letters * std::uint64_t{'a' - '9' - 1};
  return __builtin_bswap64(digits);
}

void store(char* target, std::uint64_t digits) {
  if constexpr (std::endian::native == std::endian::big) {
    digits = __builtin_bswap64(digits);
  }
  std::memcpy(target, &digits, sizeof digits);
}

class Fnv1a {
 public:
  void byte(unsigned char byte) { hash_ = (hash_ ^ byte) * 0x100000001b3U; }
  void word(std::uint32_t word) {
    for (unsigned int shift = 0; shift < 32; shift += 8) {
      byte(static_cast<unsigned char>((word >> shift) & 0xFFU));
    }
  }
  void text(std::string_view text) {
    for (const char character : text) {
      byte(asByte(character));
    }
  }
  [[nodiscard]] std::uint64_t hash() const { return hash_; }

 private:
  std::uint64_t hash_ = 0xcbf29ce484222325U;
};

}  // namespace

NodeNumber numberFor(int type, std::string_view position, std::uint32_t n) {
  if (type == Oru::NodeLexicon::ComputerSystemNode && position == computerPosition && n == 1) {
    return computerNumber;
  }
  Fnv1a hash;
  hash.word(static_cast<std::uint32_t>(type));
  hash.text(position);
  if (n > 1) {
    hash.byte(0);
    hash.word(n);
  }
  // 60 bits: their text has at most 15 digits, which a string holds without an allocation.
  constexpr unsigned int bits = 60;
  const std::uint64_t mixed = mix64(hash.hash());
  const NodeNumber number = (mixed ^ (mixed >> bits)) & ((NodeNumber{1} << bits) - 1);
  return number <= computerNumber ? number + 2 : number;
}

std::string cleanText(std::string_view text) {
  if (isPlain(text)) {
    return std::string(text);
  }
  std::string clean;
  clean.reserve(text.size());
  while (!text.empty()) {
    const Character character = firstCharacter(text);
    if (!character.isValid) {
      clean += replacementCharacter;
    } else if (character.isControl || text.front() == ' ') {
      if (!clean.empty()) {
        clean += ' ';
      }
    } else {
      clean += text.substr(0, character.length);
    }
    text.remove_prefix(character.length);
  }
  trimEnd(clean);
  return clean;
}

std::string pathText(NodeNumber number) {
  std::array<char, 16> digits;
  store(digits.data(), eightDigits(number >> 32U));
  store(digits.data() + 8, eightDigits(number & 0xFFFFFFFFU));
  const std::size_t length =
      number == 0 ? 1 : (67U - static_cast<unsigned int>(std::countl_zero(number))) / 4;
  return {digits.data() + digits.size() - length, length};
}

std::optional<NodeNumber> numberFromText(std::string_view text) {
  NodeNumber number = 0;
  const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), number, 16);
  if (error != std::errc{} || end != text.data() + text.size()) {
    return std::nullopt;
  }
  return number;
}

}  // namespace agent
