// SMBIOS tables described as text.
#pragma once

#include <agent/discovery/dmi/SmbiosTable.h>

#include <string>
#include <string_view>

namespace agent::discovery::test {

/// The bytes of a table. Each line describes a structure: its type, its handle, the fields behind its header,
/// and its strings:
///
///   0 @0x0000: 1b 2b 0xf000w 3b | Corvane Ltd. | U41 v2.66 | 03/09/2023
///
/// A field is a number with its width behind it: b, w, d and q for 1, 2, 4 and 8 bytes. A structure's length
/// follows from its fields. A line that begins with "end" is an end marker.
std::string smbiosTable(std::string_view description);

/// A 32-bit entry point with right checksums.
std::string entryPoint32(unsigned int major, unsigned int minor, std::size_t tableLength,
                         std::size_t structures);

/// A 64-bit one.
std::string entryPoint64(unsigned int major, unsigned int minor, std::size_t tableLength);

/// `bytes` as the parsers take them.
inline smbios::Bytes bytesOf(std::string_view bytes) {
  return std::as_bytes(std::span(bytes.data(), bytes.size()));
}

}  // namespace agent::discovery::test
