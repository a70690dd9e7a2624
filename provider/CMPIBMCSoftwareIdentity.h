// The association KELVO_BMCSoftwareIdentity: the firmware of the management controller and its computer
// system.
#pragma once

#include <cmpi/cmpidt.h>

#include "FirmwareAssociation.h"
#include "Linux/BMCSoftwareIdentity.h"

namespace Oru::SoftwareInventoryProfileProvider {

/// The reference Antecedent holds a KELVO_SPComputerSystem, Dependent the firmware's KELVO_SoftwareIdentity.
class CMPIBMCSoftwareIdentity : public FirmwareAssociation<BMCSoftwareIdentity> {
 public:
  /// Throws what the resolver and the ends throw.
  CMPIBMCSoftwareIdentity(const CMPIBroker* broker, const CMPIContext* context,
                          const CMPIObjectPath* objectPath);
  ~CMPIBMCSoftwareIdentity();
  CMPIBMCSoftwareIdentity(const CMPIBMCSoftwareIdentity&) = delete;
  CMPIBMCSoftwareIdentity& operator=(const CMPIBMCSoftwareIdentity&) = delete;
};

}  // namespace Oru::SoftwareInventoryProfileProvider
