// The firmware of the management controller.
#pragma once

#include <agent/discovery/Source.h>
#include <agent/discovery/ipmi/IpmiChannel.h>

namespace agent::discovery {

/// Finds the firmware of each management controller: one node, described "BMC Firmware". The kernel's
/// attributes tell; where they do not, the controller is asked through `open` (empty: it is not asked).
void readIpmi(SourceContext& context, const IpmiOpener& open);

}  // namespace agent::discovery
