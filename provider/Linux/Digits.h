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

/// The decimal digits of a number, without leading zeros, and a character behind them; NUL for none.
class DecimalText {
 public:
  explicit DecimalText(std::uint64_t number, char last = '\0') { set(number, last); }
  void set(std::uint64_t number, char last = '\0');

  /// It lives as long as this object; `room` characters can be read there.
  [[nodiscard]] std::string_view view() const { return {characters_.data(), length_}; }
  static constexpr std::size_t room = 24;

 private:
  void keep(std::uint64_t first, std::uint64_t second, std::uint64_t third, std::uint64_t fourth);

  std::array<char, room> characters_{};
  std::size_t length_ = 0;
};

}  // namespace Oru::SoftwareInventoryProfileProvider
