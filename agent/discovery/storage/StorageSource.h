// The firmware of drives and of the adapters that they hang on.
#pragma once

#include <agent/discovery/Source.h>

#include <vector>

namespace agent::discovery {

/// Finds storage adapters, NVMe drives and SCSI devices (with those of ATA, SAS, USB) that tell a firmware
/// version: a device node for each, its firmware below.
void readStorage(SourceContext& context);

// Its parts.
std::vector<FoundNode> readAdapters(SourceContext& context);
std::vector<FoundNode> readNvmeDrives(SourceContext& context);
std::vector<FoundNode> readScsiDevices(SourceContext& context);

}  // namespace agent::discovery
