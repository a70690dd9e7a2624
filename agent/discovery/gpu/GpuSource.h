// The video BIOS of graphics processors.
#pragma once

#include <agent/discovery/Source.h>

namespace agent::discovery {

/// Finds each graphics processor whose driver tells the version of its video BIOS.
void readGpu(SourceContext& context);

}  // namespace agent::discovery
