// Firmware that the SMBIOS table declares (type 45), as the discovery takes it up.
#pragma once

#include <agent/discovery/Source.h>
#include <agent/discovery/dmi/SmbiosStructures.h>

#include <map>
#include <optional>
#include <string>

namespace agent::discovery {

/// The structures of a table by their handles.
using StructuresByHandle = std::map<std::uint16_t, smbios::Structure>;

/// The firmware of one structure of type 45, with the device that its component handles lead to. Nothing
/// where it has no version, or is said to be absent from the machine. What is wrong with it is reported as
/// `place`.
std::optional<DeclaredFirmware> declaredFirmware(SourceContext& context, const std::string& place,
                                                 const smbios::Structure& structure,
                                                 const StructuresByHandle& structures);

}  // namespace agent::discovery
