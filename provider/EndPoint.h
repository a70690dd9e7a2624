// What the cursors over other providers' instances share: how the next one is taken, and its path.
#pragma once

#include <cmpi/cmpidt.h>

namespace Oru::SoftwareInventoryProfileProvider {

/// The next instance of an enumeration, without asking first whether there is one; null where the enumeration
/// gives none, or is null itself.
CMPIInstance* nextInstance(const CMPIEnumeration* enumeration);

/// The path of an instance; null where it gives none, or is null itself.
CMPIObjectPath* pathOfInstance(const CMPIInstance* instance);

}  // namespace Oru::SoftwareInventoryProfileProvider
