#include "Linux/InstanceId.h"

#include <array>
#include <charconv>

#include "Linux/StreamExtraction.h"

namespace Oru::SoftwareInventoryProfileProvider {

namespace {

/// Digits of a 64-bit number in some base, without a string of its own.
class NumberText {
 public:
  NumberText(std::uint64_t number, int base)
      : end_(std::to_chars(digits_.data(), digits_.data() + digits_.size(), number, base).ptr) {}
  NumberText(const NumberText&) = delete;
  NumberText& operator=(const NumberText&) = delete;

  [[nodiscard]] std::string_view view() const {
    return {digits_.data(), static_cast<std::size_t>(end_ - digits_.data())};
  }

 private:
  std::array<char, 20> digits_{};
  const char* end_;
};

}  // namespace

void InstanceIdMaker::make(const std::string& parentText, const std::string& nodeText,
                           std::string& instanceId) {
  if (parentText != parentText_) {
    const NumberText parent(StreamExtraction(parentText).hexadecimal(), 10);
    prefix_.assign(parent.view()).append(1, '@');
    parentText_ = parentText;
  }
  instanceId.assign(prefix_).append(nodeText);
}

InstanceIdParts parseInstanceId(std::string_view instanceId) {
  StreamExtraction text(instanceId);
  const std::uint64_t parent = text.decimal();
  text.character();
  return {parent, text.word()};
}

std::string parentPathText(std::string_view identifier) {
  return std::string(NumberText(StreamExtraction(identifier).decimal(), 16).view());
}

}  // namespace Oru::SoftwareInventoryProfileProvider
