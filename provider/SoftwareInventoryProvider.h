// The provider's front end: the functions behind its two CMPI function tables.
//
// Every function of the tables is named SoftwareInventory_ followed by the CMPI operation, and follows the
// CMPI standard in its arguments and in who owns what. The object manager may call them from several threads.
// A status never carries a message text: diagnostics go to the log.
#pragma once

#include <cmpi/cmpift.h>

#include <cstdint>
#include <vector>

namespace Oru::SoftwareInventoryProfileProvider {

/// The broker of the most recent factory call, for both tables; null before the first.
extern const CMPIBroker* broker;

/// Appends to `ids` the class ids that `className` stands for: the one that the framework knows it by, or
/// else those of the associations that it is an ancestor of (or is): 3 for CIM_InstalledSoftwareIdentity; 35,
/// 117, 118 for CIM_ElementSoftwareIdentity. True if it appended any.
bool getClassId(const char* className, const char* nameSpace, std::vector<std::uint16_t>& ids);

}  // namespace Oru::SoftwareInventoryProfileProvider

extern "C" {

/// Stores `broker` and returns the instance interface, which lives as long as the library is loaded. Cannot
/// fail and leaves `status` alone.
[[gnu::visibility("default")]] CMPIInstanceMI* SoftwareInventoryProvider_Create_InstanceMI(
    const CMPIBroker* broker, const CMPIContext* context, CMPIStatus* status);

/// The same for the association interface.
[[gnu::visibility("default")]] CMPIAssociationMI* SoftwareInventoryProvider_Create_AssociationMI(
    const CMPIBroker* broker, const CMPIContext* context, CMPIStatus* status);
}
