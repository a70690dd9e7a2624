#include <cimom/xml/Text.h>

#include <array>
#include <cstddef>
#include <cstdint>
#include <cstring>

namespace cimom::xml {

namespace {

constexpr std::string_view replacement = "\xef\xbf\xbd";

enum class Kind : std::uint8_t { plain, entity, layout, forbidden, sequence };

constexpr std::array<Kind, 256> makeKinds() {
  std::array<Kind, 256> kinds{};
  for (std::size_t byte = 0; byte < kinds.size(); ++byte) {
    if (byte < 0x20)
      kinds[byte] = Kind::forbidden;
    else
      kinds[byte] = byte < 0x80 ? Kind::plain : Kind::sequence;
  }
  for (const char entity : {'&', '<', '>', '"', '\r'})
    kinds[static_cast<unsigned char>(entity)] = Kind::entity;
  kinds['\t'] = Kind::layout;
  kinds['\n'] = Kind::layout;
  return kinds;
}

constexpr std::array<Kind, 256> kinds = makeKinds();

Kind kindOf(char character) {
  return kinds[static_cast<unsigned char>(character)];
}

// Whether any of eight bytes is other than plain: below a space, one of " & < >, or not ASCII. May say yes
// where no byte is, which costs nothing but the closer look.
bool needsLook(const char* eight) {
  constexpr std::uint64_t ones = 0x0101010101010101U;
  constexpr std::uint64_t highs = ones * 0x80U;
  std::uint64_t bytes = 0;
  std::memcpy(&bytes, eight, sizeof bytes);
  const std::uint64_t angles = (bytes | (ones * 0x02U)) ^ (ones * '>');  // '<' differs from '>' by 0x02
  const std::uint64_t quotes = (bytes | (ones * 0x04U)) ^ (ones * '&');  // '"' differs from '&' by 0x04
  const std::uint64_t zeroOrLess = (angles - ones) | (quotes - ones) | (bytes - ones * ' ');
  return ((zeroOrLess | bytes) & highs) != 0;
}

// How many of the first bytes need nothing.
std::size_t plainLength(std::string_view text) {
  std::size_t size = 0;
  while (text.size() - size >= 8 && !needsLook(text.data() + size))
    size += 8;
  while (size < text.size() && kindOf(text[size]) == Kind::plain)
    ++size;
  return size;
}

std::string_view entityFor(char character) {
  switch (character) {
    case '&':
      return "&amp;";
    case '<':
      return "&lt;";
    case '>':
      return "&gt;";
    case '"':
      return "&quot;";
    case '\t':
      return "&#9;";
    case '\n':
      return "&#10;";
    default:
      return "&#13;";
  }
}

struct Sequence {
  std::size_t size;  // of the bytes that belong together
  bool isCharacter;  // one that XML carries
};

// How many bytes a first byte asks for, and between what the second must be: the table of well-formed UTF-8
// in the Unicode standard, which leaves out surrogates and longer forms than needed.
struct Lead {
  std::size_t size;
  unsigned char lowest;
  unsigned char highest;
};

Lead leadOf(unsigned char first) {
  if (first >= 0xc2 && first <= 0xdf)
    return {2, 0x80, 0xbf};
  if (first >= 0xe0 && first <= 0xef)
    return {3, static_cast<unsigned char>(first == 0xe0 ? 0xa0 : 0x80),
            static_cast<unsigned char>(first == 0xed ? 0x9f : 0xbf)};
  if (first >= 0xf0 && first <= 0xf4)
    return {4, static_cast<unsigned char>(first == 0xf0 ? 0x90 : 0x80),
            static_cast<unsigned char>(first == 0xf4 ? 0x8f : 0xbf)};
  return {1, 0, 0};
}

Sequence sequenceAt(std::string_view text) {
  const Lead lead = leadOf(static_cast<unsigned char>(text[0]));
  if (lead.size == 1)
    return {1, false};
  unsigned char lowest = lead.lowest;
  unsigned char highest = lead.highest;
  for (std::size_t index = 1; index < lead.size; ++index) {
    if (index == text.size())
      return {index, false};
    const auto byte = static_cast<unsigned char>(text[index]);
    if (byte < lowest || byte > highest)
      return {index, false};
    lowest = 0x80;
    highest = 0xbf;
  }
  const bool isNonCharacter = text.starts_with("\xef\xbf\xbe") || text.starts_with("\xef\xbf\xbf");
  return {lead.size, !isNonCharacter};
}

template <bool isAttribute>
void appendEscaped(std::string& out, std::string_view plain) {
  while (true) {
    const std::size_t size = plainLength(plain);
    out.append(plain.data(), size);
    plain.remove_prefix(size);
    if (plain.empty())
      return;
    std::size_t used = 1;
    switch (kindOf(plain[0])) {
      case Kind::plain:
        break;
      case Kind::entity:
        out += entityFor(plain[0]);
        break;
      case Kind::layout:
        if (isAttribute)
          out += entityFor(plain[0]);
        else
          out += plain[0];
        break;
      case Kind::forbidden:
        out += replacement;
        break;
      case Kind::sequence: {
        const Sequence sequence = sequenceAt(plain);
        out += sequence.isCharacter ? plain.substr(0, sequence.size) : replacement;
        used = sequence.size;
        break;
      }
    }
    plain.remove_prefix(used);
  }
}

}  // namespace

void appendText(std::string& out, std::string_view plain) {
  appendEscaped<false>(out, plain);
}

void appendAttributeText(std::string& out, std::string_view plain) {
  appendEscaped<true>(out, plain);
}

void appendCharacter(std::string& out, char16_t unit) {
  const auto code = static_cast<unsigned>(unit);
  std::string utf8;
  if (code < 0x80) {
    utf8 = {static_cast<char>(code)};
  } else if (code < 0x800) {
    utf8 = {static_cast<char>(0xc0U | (code >> 6U)), static_cast<char>(0x80U | (code & 0x3fU))};
  } else if (code >= 0xd800 && code < 0xe000) {
    utf8 = replacement;
  } else {
    utf8 = {static_cast<char>(0xe0U | (code >> 12U)), static_cast<char>(0x80U | ((code >> 6U) & 0x3fU)),
            static_cast<char>(0x80U | (code & 0x3fU))};
  }
  appendText(out, utf8);
}

}  // namespace cimom::xml
