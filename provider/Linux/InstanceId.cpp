#include "Linux/InstanceId.h"

#include <charconv>
#include <cstring>
#include <tuple>

#include "Linux/StreamExtraction.h"

namespace Oru::SoftwareInventoryProfileProvider {

namespace {

std::uint64_t numberOf(const std::string& pathText) {
  const auto digits = numberOfHexadecimalDigits(pathText);
  return digits ? *digits : StreamExtraction(pathText).hexadecimal();
}

}  // namespace

void InstanceIdMaker::make(const std::string& parentText, const std::string& nodeText,
                           std::string& instanceId) {
  const std::uint64_t parent = numberOf(parentText);
  if (parent != parent_) {
    parent_ = parent;
    prefix_.set(parent, '@');
  }
  const std::string_view prefix = prefix_.view();
  // Nearly all node texts are of this length, and so are nearly all InstanceIDs of what went before: pieces
  // of known lengths, the node's with its NUL, are put in place without a call.
  constexpr std::size_t usualLength = 15;
  if (nodeText.size() != usualLength) {
    instanceId.assign(prefix).append(nodeText);
    return;
  }
  instanceId.resize(prefix.size() + usualLength);
  if (prefix.size() <= 16) {
    std::memcpy(instanceId.data(), prefix.data(), 16);
  } else {
    std::memcpy(instanceId.data(), prefix.data(), DecimalText::room);
  }
  std::memcpy(instanceId.data() + prefix.size(), nodeText.data(), usualLength + 1);
}

std::string nodeNumber(const std::string& pathText) {
  return std::string(DecimalText(numberOf(pathText)).view());
}

InstanceIdParts parseInstanceId(std::string_view instanceId) {
  StreamExtraction text(instanceId);
  const std::uint64_t parent = text.decimal();
  text.character();
  return {parent, text.word()};
}

std::string parentPathText(std::string_view identifier) {
  std::array<char, 16> digits{};
  const std::uint64_t number = StreamExtraction(identifier).decimal();
  char* const end = std::to_chars(digits.data(), digits.data() + digits.size(), number, 16).ptr;
  return std::string(digits.data(), end);
}

}  // namespace Oru::SoftwareInventoryProfileProvider
