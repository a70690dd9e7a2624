// The system firmware, as the kernel read it from the DMI tables.
#pragma once

#include <agent/discovery/Source.h>

namespace agent::discovery {

/// Finds the system firmware: one node, described "BIOS" on BIOS and UEFI machines alike.
void readDmi(SourceContext& context);

}  // namespace agent::discovery
