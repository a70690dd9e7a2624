// The place of a device: which function of which bus it is, or is a part of.
#pragma once

#include <agent/discovery/Source.h>

#include <string>
#include <string_view>

namespace agent::discovery {

/// The address of the nearest function of a bus at or above the device in `folder`, a path without links
/// (`SystemRoot::resolve`): "0000:3b:00.0" on PCI, "BUS:ADDRESS" elsewhere, such as "usb:1-1.4:1.0". A virtio
/// or auxiliary device is a part of the function above it. "device:NAME" where no bus is found.
std::string functionAddress(const SourceContext& context, const std::string& folder);

/// Whether `text` has the form of a PCI address with its domain.
bool isPciAddress(std::string_view text);

}  // namespace agent::discovery
