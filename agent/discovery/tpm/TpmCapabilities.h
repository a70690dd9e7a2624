// What the kernel shows of a TPM.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

namespace agent::discovery {

struct TpmCapabilities {
  std::optional<std::string> maker;    ///< the four characters of its id, "IFX"
  std::optional<std::string> version;  ///< of its firmware, "4.32"
  std::optional<std::uint32_t> major;
  std::optional<std::uint32_t> minor;
};

/// Reads the lines of `caps` ("Manufacturer: 0x49465800", "Firmware version: 4.32"); others are passed over.
TpmCapabilities parseTpmCapabilities(std::string_view text);

}  // namespace agent::discovery
