#include <cimom/http/BasicLogin.h>
#include <strings.h>

#include <array>
#include <cstdint>

namespace cimom::http {
namespace {

constexpr unsigned bitsOfLetter = 6;
constexpr unsigned bitsOfByte = 8;
constexpr std::size_t lettersOfGroup = 4;

int valueOf(char letter) {
  constexpr std::string_view alphabet = "ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789+/";
  const std::size_t at = alphabet.find(letter);
  return at == std::string_view::npos ? -1 : static_cast<int>(at);
}

std::optional<std::string> decodeBase64(std::string_view text) {
  if (text.size() % lettersOfGroup != 0) {
    return std::nullopt;
  }
  for (int padding = 0; padding < 2 && !text.empty() && text.back() == '='; ++padding) {
    text.remove_suffix(1);
  }
  std::string bytes;
  std::uint32_t collected = 0;
  unsigned bits = 0;
  for (const char letter : text) {
    const int value = valueOf(letter);
    if (value < 0) {
      return std::nullopt;
    }
    collected = (collected << bitsOfLetter) | static_cast<std::uint32_t>(value);
    bits += bitsOfLetter;
    if (bits >= bitsOfByte) {
      bits -= bitsOfByte;
      bytes.push_back(static_cast<char>((collected >> bits) & 0xFFU));
      collected &= (1U << bits) - 1;
    }
  }
  // Bits that are left over belong to no byte: another text with the same meaning would pass.
  return collected == 0 ? std::optional(bytes) : std::nullopt;
}

std::string_view withoutBlanks(std::string_view text) {
  while (!text.empty() && (text.front() == ' ' || text.front() == '\t')) {
    text.remove_prefix(1);
  }
  while (!text.empty() && (text.back() == ' ' || text.back() == '\t')) {
    text.remove_suffix(1);
  }
  return text;
}

}  // namespace

std::optional<BasicLogin> parseBasicLogin(std::string_view header) {
  constexpr std::string_view scheme = "basic";
  header = withoutBlanks(header);
  if (header.size() <= scheme.size() || strncasecmp(header.data(), scheme.data(), scheme.size()) != 0 ||
      header[scheme.size()] != ' ') {
    return std::nullopt;
  }
  const auto decoded = decodeBase64(withoutBlanks(header.substr(scheme.size())));
  if (!decoded || decoded->find('\0') != std::string::npos) {
    return std::nullopt;
  }
  const std::size_t colon = decoded->find(':');
  if (colon == std::string::npos) {
    return std::nullopt;
  }
  return BasicLogin{decoded->substr(0, colon), decoded->substr(colon + 1)};
}

std::string printable(std::string_view text) {
  constexpr std::size_t longest = 60;
  constexpr std::string_view digits = "0123456789abcdef";
  std::string safe;
  for (const char letter : text.substr(0, longest)) {
    if (letter >= ' ' && letter <= '~' && letter != '\\' && letter != '"') {
      safe.push_back(letter);
      continue;
    }
    const auto byte = static_cast<unsigned char>(letter);
    safe += {'\\', 'x', digits[byte >> 4U], digits[byte & 0xFU]};
  }
  return text.size() > longest ? safe + "..." : safe;
}

}  // namespace cimom::http
