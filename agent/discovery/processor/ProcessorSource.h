// The microcode of the processors.
#pragma once

#include <agent/discovery/Source.h>

namespace agent::discovery {

/// Finds the microcode: one processor with it for each distinct revision; none in a virtual machine.
void readProcessor(SourceContext& context);

}  // namespace agent::discovery
