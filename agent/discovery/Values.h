// What the values of attributes mean, whatever their source.
#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace agent::discovery {

/// `text` through `cleanText`; nothing where it only stands in for a value: "", "N/A", "To be filled by
/// O.E.M.", "Not Specified", "Default string" and the like, in any case of letters.
std::optional<std::string> meaningful(std::string_view text);

/// A decimal number, or a hexadecimal one after "0x", with nothing around it but blanks; nothing where it is
/// none or is above `limit`.
std::optional<std::uint32_t> parseNumber(std::string_view text, std::uint32_t limit = 0xffffffff);

/// Whether a version is nothing but zeros and what stands between them: "00.00.00.00", "0x0", "0.0". Drivers
/// show that for a version that they never got.
bool isZeroVersion(std::string_view text);

/// Names in a list for people, separated by ", ". From `limit` bytes on the rest is counted: "a, b and 3
/// more". The first name always stands.
std::string joinNames(const std::vector<std::string>& names, std::size_t limit);

}  // namespace agent::discovery
