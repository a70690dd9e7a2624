// Firmware that the DMI tables tell of (SMBIOS, DSP0134).
#pragma once

#include <agent/discovery/Source.h>

namespace agent::discovery {

/// Finds the system firmware (one node, described "BIOS" on BIOS and UEFI machines alike), the embedded
/// controller and the TPM with their firmware, and what else the machine declares. Without the right to read
/// the tables, or without tables, the first two alone.
void readDmi(SourceContext& context);

}  // namespace agent::discovery
