// The firmware of the management engine in the chipset.
#pragma once

#include <agent/discovery/Source.h>

namespace agent::discovery {

/// Finds each management engine that tells its versions.
void readEngine(SourceContext& context);

}  // namespace agent::discovery
