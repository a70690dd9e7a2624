#include <agent/discovery/Values.h>
#include <agent/framework/Case.h>
#include <agent/framework/NodeTree.h>

#include <algorithm>
#include <array>
#include <charconv>
#include <utility>

namespace agent::discovery {

std::optional<std::string> meaningful(std::string_view text) {
  // What board makers and drivers leave in place of a value, in lower case.
  static constexpr std::array<std::string_view, 14> fillers = {"",
                                                               "n/a",
                                                               "na",
                                                               "none",
                                                               "null",
                                                               "unknown",
                                                               "undefined",
                                                               "default",
                                                               "(none)",
                                                               "default string",
                                                               "not specified",
                                                               "not available",
                                                               "not present",
                                                               "not applicable"};
  static constexpr std::string_view toBeFilled = "to be filled";

  std::string clean = cleanText(text);
  std::string low = clean;
  std::transform(low.begin(), low.end(), low.begin(), lower);
  if (low.starts_with(toBeFilled) || std::find(fillers.begin(), fillers.end(), low) != fillers.end()) {
    return std::nullopt;
  }
  return clean;
}

std::optional<std::uint32_t> parseNumber(std::string_view text, std::uint32_t limit) {
  static constexpr std::string_view blanks = " \t\r\n";
  const std::size_t begin = text.find_first_not_of(blanks);
  if (begin == std::string_view::npos) {
    return std::nullopt;
  }
  text = text.substr(begin, text.find_last_not_of(blanks) - begin + 1);
  const bool hexadecimal = text.starts_with("0x");
  if (hexadecimal) {
    text.remove_prefix(2);
  }
  std::uint32_t number = 0;
  const char* const end = text.data() + text.size();
  const auto [stop, error] = std::from_chars(text.data(), end, number, hexadecimal ? 16 : 10);
  if (error != std::errc() || stop != end || number > limit) {
    return std::nullopt;
  }
  return number;
}

bool isZeroVersion(std::string_view text) {
  return text.find('0') != std::string_view::npos &&
         text.find_first_not_of("0.:x- ") == std::string_view::npos;
}

std::string joinNames(const std::vector<std::string>& names, std::size_t limit) {
  std::string joined;
  for (std::size_t i = 0; i < names.size(); ++i) {
    if (i > 0 && joined.size() + names[i].size() > limit) {
      return joined + " and " + std::to_string(names.size() - i) + " more";
    }
    joined += (i > 0 ? ", " : "") + names[i];
  }
  return joined;
}

}  // namespace agent::discovery
