// What a management controller says of its firmware, in the form of its own answer and in the kernel's.
#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <vector>

namespace agent::discovery {

struct ControllerFirmware {
  std::string version;  ///< "2.05": the major revision, and the minor one as its two digits
  std::uint32_t major = 0;
  /// Nothing where the minor revision is no number in BCD, as some makers fill the byte in binary.
  std::optional<std::uint32_t> minor;
  /// The four auxiliary bytes in the order of the answer, "01 a0 00 00"; nothing where all are zero. Each
  /// maker gives them a meaning of his own, often the rest of the version.
  std::optional<std::string> auxiliary;
  /// The version with the first, and with all auxiliary bytes behind it, as some makers write it; none where
  /// they are zero.
  std::vector<std::string> otherForms;
};

/// Reads the data of an answer to Get Device ID (IPMI 2.0, 20.1), from the byte behind the completion code
/// on; nothing where it ends before the firmware revision's and the IPMI version's bytes.
std::optional<ControllerFirmware> parseDeviceId(std::span<const std::byte> data);

/// Reads what the kernel shows of the same: `revision` is "MAJOR.MINOR", the first decimal and the second
/// hexadecimal, so that BCD is read as it is; `auxiliary` is "0xDD 0xCC 0xBB 0xAA", last byte first, and may
/// be absent. Nothing where the revision has another form; auxiliary bytes of another form are left out.
std::optional<ControllerFirmware> parseRevisionText(std::string_view revision,
                                                    const std::optional<std::string>& auxiliary);

}  // namespace agent::discovery
