// The firmware of the TPM.
#pragma once

#include <agent/discovery/Source.h>

namespace agent::discovery {

/// Finds each TPM that tells its firmware version.
void readTpm(SourceContext& context);

}  // namespace agent::discovery
