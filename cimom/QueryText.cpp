#include <cimom/Names.h>
#include <cimom/QueryText.h>

#include <algorithm>
#include <array>
#include <cstddef>

namespace cimom {

namespace {

bool isNameCharacter(char character) {
  const char folded = foldCase(character);
  return (folded >= 'a' && folded <= 'z') || (character >= '0' && character <= '9') || character == '_';
}

/// Takes one word or any other character off the front; a quoted text, with a backslash before a quote in
/// it, is left out.
std::string_view nextToken(std::string_view& rest) {
  while (!rest.empty() && (rest.front() == '\'' || rest.front() == '"')) {
    std::size_t end = 1;
    while (end < rest.size() && rest[end] != rest.front())
      end += rest[end] == '\\' ? 2U : 1U;
    rest.remove_prefix(std::min(end + 1, rest.size()));
  }
  const auto* const end = std::find_if_not(rest.begin(), rest.end(), isNameCharacter);
  const std::size_t size = std::max<std::size_t>(static_cast<std::size_t>(end - rest.begin()), 1);
  const std::string_view token = rest.substr(0, size);
  rest.remove_prefix(token.size());
  return token;
}

bool isBlank(std::string_view token) {
  return token.find_first_not_of(" \t\r\n") == std::string_view::npos;
}

}  // namespace

bool isKnownQueryLanguage(std::string_view language) {
  constexpr std::array<std::string_view, 5> known = {"WQL", "CQL", "DMTF:CQL", "CIM:CQL", "CIMCQL"};
  return std::any_of(known.begin(), known.end(),
                     [language](std::string_view each) { return sameName(each, language); });
}

std::string classOfQuery(std::string_view query) {
  bool isAfterFrom = false;
  while (!query.empty()) {
    const std::string_view token = nextToken(query);
    if (isBlank(token))
      continue;
    if (isAfterFrom)
      return isNameCharacter(token.front()) ? std::string(token) : std::string();
    isAfterFrom = sameName(token, "from");
  }
  return {};
}

}  // namespace cimom
