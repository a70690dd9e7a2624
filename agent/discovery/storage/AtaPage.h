// What a drive behind a SCSI to ATA translation says of itself.
#pragma once

#include <optional>
#include <string>
#include <string_view>

namespace agent::discovery {

/// Of an ATA drive, whole: SCSI cuts the firmware revision to its last 4 characters and the model to its
/// first 16.
struct AtaIdentity {
  std::optional<std::string> firmware;
  std::optional<std::string> model;
};

/// Reads the vital product data page 89h (SAT, "ATA information"). Nothing where the bytes are too few, are
/// another page, or hold no answer to IDENTIFY (PACKET) DEVICE.
std::optional<AtaIdentity> parseAtaPage(std::string_view page);

}  // namespace agent::discovery
