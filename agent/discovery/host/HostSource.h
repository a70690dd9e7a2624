// The host's own name.
#pragma once

#include <agent/discovery/Source.h>

namespace agent::discovery {

/// Reads the name under which the computer system is known.
void readHost(SourceContext& context);

}  // namespace agent::discovery
