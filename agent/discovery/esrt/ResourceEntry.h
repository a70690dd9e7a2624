// The forms of the UEFI firmware resource table.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace agent::discovery {

/// The class id in lower case; nothing where `text` is no GUID, or the GUID of zeros alone, which fills
/// unused entries.
std::optional<std::string> parseClassId(std::string_view text);

/// "0x0001001b": the eight hexadecimal digits of a 32-bit version; nothing for 0, which stands for none. What
/// the digits mean is the maker's secret; in this form the common ones (four bytes, two halves, 8 + 8 + 16
/// bits) can be read off, and two versions compare as texts as they do as numbers.
std::optional<std::string> versionText(std::uint32_t version);

/// The forms in which makers write the version: decimal, four bytes ("0.1.0.27"), two halves ("1.27"), and
/// 8 + 8 + 16 bits ("0.1.27").
std::vector<std::string> versionForms(std::uint32_t version);

/// What a status of the last attempt to update (UEFI 2.10, 23.4) says: "success", "authentication failed";
/// "status 9" of one that is not known here.
std::string attemptText(std::uint32_t status);

/// What kind of firmware a resource type (UEFI 2.10, 23.4) is, in words of our own.
const char* resourceDescription(std::uint32_t type);

}  // namespace agent::discovery
