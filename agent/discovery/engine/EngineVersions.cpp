#include <agent/discovery/Values.h>
#include <agent/discovery/engine/EngineVersions.h>

#include <algorithm>
#include <array>
#include <charconv>
#include <optional>

namespace agent::discovery {

namespace {

std::optional<EngineVersion> parseLine(std::string_view line) {
  static constexpr std::string_view separators = ":...";  // between the five numbers
  std::array<std::uint32_t, separators.size() + 1> numbers{};
  const char* at = line.data();
  const char* const end = at + line.size();
  for (std::size_t i = 0; i < numbers.size(); ++i) {
    if (i > 0 && (at == end || *at++ != separators[i - 1])) {
      return std::nullopt;
    }
    const auto [stop, error] = std::from_chars(at, end, numbers.at(i));
    if (error != std::errc()) {
      return std::nullopt;
    }
    at = stop;
  }
  const std::string_view version = line.substr(line.find(':') + 1);
  if (at != end || isZeroVersion(version)) {
    return std::nullopt;
  }
  return EngineVersion{std::string(version), numbers[1], numbers[2]};
}

}  // namespace

std::vector<EngineVersion> parseEngineVersions(std::string_view text) {
  std::vector<EngineVersion> versions;
  while (!text.empty()) {
    const std::size_t end = std::min(text.find('\n'), text.size());
    const std::optional<EngineVersion> version = parseLine(text.substr(0, end));
    if (version && std::find(versions.begin(), versions.end(), *version) == versions.end()) {
      versions.push_back(*version);
    }
    text.remove_prefix(std::min(end + 1, text.size()));
  }
  return versions;
}

}  // namespace agent::discovery
