// The association KELVO_BIOSSoftwareIdentity: the system firmware and its computer system.
#pragma once

#include <cmpi/cmpidt.h>

#include "FirmwareAssociation.h"
#include "Linux/BIOSSoftwareIdentity.h"

namespace Oru::SoftwareInventoryProfileProvider {

/// The reference Antecedent holds a KELVO_ComputerSystem, Dependent the firmware's KELVO_SoftwareIdentity.
class CMPIBIOSSoftwareIdentity : public FirmwareAssociation<BIOSSoftwareIdentity> {
 public:
  /// Throws what the resolver and the ends throw.
  CMPIBIOSSoftwareIdentity(const CMPIBroker* broker, const CMPIContext* context,
                           const CMPIObjectPath* objectPath);
  ~CMPIBIOSSoftwareIdentity();
  CMPIBIOSSoftwareIdentity(const CMPIBIOSSoftwareIdentity&) = delete;
  CMPIBIOSSoftwareIdentity& operator=(const CMPIBIOSSoftwareIdentity&) = delete;
};

}  // namespace Oru::SoftwareInventoryProfileProvider
