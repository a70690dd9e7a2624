// Numbers and their digits, eight at a time: every published name holds a number that comes as hexadecimal
// digits and goes as decimal ones.
#pragma once

#include <array>
#include <cstdint>
#include <optional>
#include <string_view>

namespace Oru::SoftwareInventoryProfileProvider {

/// The number that 1 to 16 hexadecimal digits of either case stand for; nothing for any other text.
std::optional<std::uint64_t> numberOfHexadecimalDigits(std::string_view text);

/// The decimal digits of a number, without leading zeros.
class DecimalText {
 public:
  explicit DecimalText(std::uint64_t number);
  DecimalText(const DecimalText&) = delete;
  DecimalText& operator=(const DecimalText&) = delete;

  /// It lives as long as this object.
  [[nodiscard]] std::string_view view() const { return {digits_.data() + begin_, digits_.size() - begin_}; }

 private:
  std::array<char, 24> digits_;
  std::size_t begin_;
};

}  // namespace Oru::SoftwareInventoryProfileProvider
