// What the SMBIOS tables that the kernel keeps tell of firmware.
#pragma once

#include <agent/discovery/Source.h>

namespace agent::discovery {

inline constexpr const char* tablesFolder = "sys/firmware/dmi/tables";

/// The table does not tell where the TPM is, and has one at most.
inline constexpr const char* tpmPosition = "tpm";
inline constexpr const char* tpmFirmware = "TPM Firmware";

/// More structures of type 45 than any machine has; the rest are counted.
inline constexpr std::size_t declaredLimit = 1024;
/// Of the table, in bytes. Real ones have some kilobytes.
inline constexpr std::size_t tableLimit = std::size_t{4} * 1024 * 1024;

enum class TableOutcome {
  Absent,          ///< there is no table; nothing was reported
  NotRead,         ///< there is one, and it could not be read or tells nothing of the system firmware
  SystemFirmware,  ///< it tells of the system firmware
};

/// Finds the system firmware (type 0), the embedded controller's (type 0), the TPM's (type 43) and what else
/// is declared (type 45). What is whole in the table is used; the rest is reported.
TableOutcome readTables(SourceContext& context);

/// The system firmware as a node without properties.
FoundNode systemFirmware();

/// The embedded controller with its firmware.
FoundNode embeddedController(unsigned int major, unsigned int minor);

}  // namespace agent::discovery
