// The firmware that can be updated through UEFI.
#pragma once

#include <agent/discovery/Source.h>

namespace agent::discovery {

/// Finds the entries of the UEFI system resource table: one node for each. Needs root.
void readEsrt(SourceContext& context);

}  // namespace agent::discovery
