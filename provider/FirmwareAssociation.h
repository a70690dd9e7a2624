// What the associations of the two kinds of system firmware have in common: how a computer system end and a
// software identity end that hold one another's pair move.
#pragma once

#include <cmpi/cmpidt.h>

#include "AssociationAdapter.h"
#include "CMPIComputerSystem.h"

namespace Oru::SoftwareInventoryProfileProvider {

/// The far end is walked. For the association class both ends move in step, so that the pairs are (first
/// computer, first firmware), (second computer, second firmware) and so on; they end with either end.
template <typename Resolver>
class FirmwareAssociation : public AssociationAdapter<CMPISIComputerSystem, Resolver> {
 public:
  explicit operator bool();
  void operator++();

  /// From the firmware's path to the path of its computer.
  CMPIObjectPath* locateComputer(const CMPIObjectPath* objectPath);
  /// From a computer's path to the path of its firmware.
  CMPIObjectPath* locateIdentity(const CMPIObjectPath* objectPath);

 protected:
  /// The resolver's operation from computer to firmware.
  using FirmwareOf = Moniker (Resolver::*)(Moniker&);

  FirmwareAssociation(const AssociationTable& table, FirmwareOf firmwareOf, const CMPIBroker* broker,
                      const CMPIContext* context, const CMPIObjectPath* objectPath)
      : AssociationAdapter<CMPISIComputerSystem, Resolver>(table, broker, context, objectPath),
        firmwareOf_(firmwareOf) {}
  ~FirmwareAssociation() = default;

  // The three ways to set up, by what was given.

  /// The firmware is located from the first computer.
  void setUpAssociation(const CMPIObjectPath* objectPath);
  void setUpFromComputer(const CMPIObjectPath* objectPath);
  void setUpFromSoftware(const CMPIObjectPath* objectPath);

 private:
  FirmwareOf firmwareOf_;
};

}  // namespace Oru::SoftwareInventoryProfileProvider
