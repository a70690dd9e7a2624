// The entry point of an SMBIOS table (DSP0134): what says how long the table is.
#pragma once

#include <agent/discovery/dmi/SmbiosTable.h>

#include <cstdint>
#include <optional>
#include <string>

namespace agent::discovery::smbios {

/// The version tells how the whole was meant, not what a table holds: newer structures stand behind older
/// entry points. So structures are read by their own lengths, and the version is for messages.
struct EntryPoint {
  unsigned int major = 0;
  unsigned int minor = 0;
  std::uint32_t tableLength = 0;  ///< in bytes; of a 64-bit entry point it is the most that there may be
  std::optional<std::uint16_t> structures;  ///< how many; a 64-bit entry point does not tell
};

struct EntryPointOutcome {
  std::optional<EntryPoint> entryPoint;
  std::string error;  ///< where there is none: what was found and what was expected
};

/// Reads a 32-bit ("_SM_"), a 64-bit ("_SM3_") or an old ("_DMI_" alone) entry point. What has a wrong
/// checksum is none. Bytes behind it are no matter.
EntryPointOutcome parseEntryPoint(Bytes bytes);

}  // namespace agent::discovery::smbios
