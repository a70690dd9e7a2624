#include <agent/discovery/SameElement.h>
#include <agent/framework/Case.h>
#include <agent/framework/OwnNumbers.h>

#include <Oru/NodeLexicon.h>

#include <algorithm>
#include <array>
#include <set>
#include <utility>

namespace agent::discovery {

namespace {

using namespace Oru;

const std::string* textOf(const FoundNode& node, int property) {
  const auto found = std::find_if(node.texts.begin(), node.texts.end(),
                                  [&](const auto& text) { return text.first == property; });
  return found == node.texts.end() ? nullptr : &found->second;
}

bool haveSame(const FoundNode& left, const FoundNode& right, int property) {
  const std::string* const one = textOf(left, property);
  const std::string* const other = textOf(right, property);
  return one != nullptr && other != nullptr && *one == *other;
}

const std::string* versionOf(const FoundNode& node) {
  const std::string* const version = textOf(node, NodeLexicon::VersionStringProperty);
  return version != nullptr ? version : textOf(node, NodeLexicon::FirmwareRevisionProperty);
}

bool isDigit(char c) {
  return c >= '0' && c <= '9';
}

std::string withoutLeadingZeros(std::string_view version) {
  std::string text;
  for (std::size_t i = 0; i < version.size(); ++i) {
    const bool begins = text.empty() || text.back() == '.';
    const bool isLeading = begins && version[i] == '0' && i + 1 < version.size() && isDigit(version[i + 1]);
    if (!isLeading) {
      text += version[i];
    }
  }
  return text;
}

/// The words of a text that tell kinds of firmware apart.
std::set<std::string> tellingWords(std::string_view text) {
  struct Synonym {
    std::string_view words;
    std::string_view word;
  };
  static constexpr std::array<Synonym, 7> synonyms{{
      {"system firmware", "bios"},
      {"system rom", "bios"},
      {"uefi", "bios"},
      {"baseboard management controller", "bmc"},
      {"embedded controller", "ec"},
      {"management engine", "me"},
      {"trusted platform module", "tpm"},
  }};
  std::string low(text);
  std::transform(low.begin(), low.end(), low.begin(), lower);
  for (const auto& [words, word] : synonyms) {
    if (const std::size_t place = low.find(words); place != std::string::npos) {
      low.replace(place, words.size(), word);
    }
  }
  std::set<std::string> found;
  std::string word;
  for (const char c : low + ' ') {
    if (isDigit(c) || (c >= 'a' && c <= 'z')) {
      word += c;
    } else if (!word.empty()) {
      found.insert(std::exchange(word, {}));
    }
  }
  found.erase("firmware");
  found.erase("system");
  return found;
}

bool isOtherVersion(const FoundNode& node, const std::string& version) {
  return std::find(node.otherVersions.begin(), node.otherVersions.end(), version) != node.otherVersions.end();
}

}  // namespace

bool isSameVersion(std::string_view left, std::string_view right) {
  return left == right || withoutLeadingZeros(left) == withoutLeadingZeros(right);
}

bool isNameOf(std::string_view name, std::string_view description) {
  const std::set<std::string> words = tellingWords(name);
  return !words.empty() && words == tellingWords(description);
}

void setText(FoundNode& node, int property, const std::string& text) {
  const auto known = std::find_if(node.texts.begin(), node.texts.end(),
                                  [&](const auto& entry) { return entry.first == property; });
  if (known == node.texts.end()) {
    node.texts.emplace_back(property, text);
  } else {
    known->second = text;
  }
}

const std::string* declaredVersion(const FoundNode& node, const FoundNode& declared) {
  const std::string* const version = versionOf(declared);
  return version != nullptr && isOtherVersion(node, *version) ? version : nullptr;
}

bool isSameElement(const FoundNode& node, std::string_view device, const DeclaredFirmware& declared) {
  if (haveSame(node, declared.node, FirmwareIdProperty)) {
    return true;
  }
  const bool isKind = !declared.kind.empty() && declared.kind == node.description;
  const std::string* const version = versionOf(node);
  const std::string* const declaredText = versionOf(declared.node);
  if (version == nullptr) {
    return isKind;
  }
  if (declaredText == nullptr ||
      (!isSameVersion(*version, *declaredText) && !isOtherVersion(node, *declaredText))) {
    return false;
  }
  const std::string* const name = textOf(declared.node, NodeLexicon::NameProperty);
  return isKind || (declared.device && declared.device->position == device) ||
         haveSame(node, declared.node, NodeLexicon::ReleaseDateProperty) ||
         (name != nullptr && isNameOf(*name, node.description));
}

}  // namespace agent::discovery
