// Whether two sources tell of the same firmware. `Merge.h` has the rules.
#pragma once

#include <agent/discovery/Source.h>

#include <string>
#include <string_view>

namespace agent::discovery {

/// `device`: the position of what `node` stands below; empty: the computer.
bool isSameElement(const FoundNode& node, std::string_view device, const DeclaredFirmware& declared);

/// The declared version where it is to replace that of `node`, because the machine writes it in another way
/// than `node` does; else null. Lasts as long as `declared`.
const std::string* declaredVersion(const FoundNode& node, const FoundNode& declared);

/// Whether two versions differ by nothing but zeros that numbers begin with: "2.05" and "2.5".
bool isSameVersion(std::string_view left, std::string_view right);

/// Whether a name that a machine has for firmware says no more than a description: "System BIOS" says "BIOS",
/// and "NIC UEFI option ROM" says more.
bool isNameOf(std::string_view name, std::string_view description);

/// Replaces a text property, or adds it.
void setText(FoundNode& node, int property, const std::string& text);

}  // namespace agent::discovery
