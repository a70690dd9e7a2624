#include <agent/discovery/Values.h>
#include <agent/discovery/storage/AtaPage.h>

#include <cstddef>

namespace agent::discovery {

namespace {

/// Words hold two characters each, the first in the upper byte; words lie lower byte first.
std::string swappedText(std::string_view words) {
  std::string text;
  for (std::size_t i = 0; i + 1 < words.size(); i += 2) {
    text += words[i + 1];
    text += words[i];
  }
  return text;
}

/// Up to the first NUL, without the blanks that fill it up.
std::optional<std::string> field(std::string_view identify, std::size_t firstWord, std::size_t wordCount) {
  const std::string text = swappedText(identify.substr(2 * firstWord, 2 * wordCount));
  return meaningful(std::string_view(text).substr(0, text.find('\0')));
}

}  // namespace

std::optional<AtaIdentity> parseAtaPage(std::string_view page) {
  static constexpr char ataPage = '\x89';
  static constexpr std::size_t commandAt = 56;
  static constexpr std::size_t identifyAt = 60;
  static constexpr std::size_t identifySize = 512;
  static constexpr char identifyDevice = '\xec';
  static constexpr char identifyPacketDevice = '\xa1';
  if (page.size() < identifyAt + identifySize || page[1] != ataPage ||
      (page[commandAt] != identifyDevice && page[commandAt] != identifyPacketDevice)) {
    return std::nullopt;
  }
  const std::string_view identify = page.substr(identifyAt, identifySize);
  return AtaIdentity{field(identify, 23, 4), field(identify, 27, 20)};
}

}  // namespace agent::discovery
