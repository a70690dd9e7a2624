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

  FirmwareAssociation(const AssociationTable& associationTable, FirmwareOf firmwareOf,
                      const CMPIBroker* objectManager, const CMPIContext* requestContext,
                      const CMPIObjectPath* objectPath)
      : AssociationAdapter<CMPISIComputerSystem, Resolver>(associationTable, objectManager, requestContext,
                                                           objectPath),
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

template <typename Resolver>
void FirmwareAssociation<Resolver>::setUpAssociation(const CMPIObjectPath* objectPath) {
  this->elementEnd.setObjectPath(locateComputer(objectPath), false);
  this->softwareIdentityEnd.setObjectPath(locateIdentity(this->elementEnd.getObjectPath()));
}

template <typename Resolver>
void FirmwareAssociation<Resolver>::setUpFromComputer(const CMPIObjectPath* objectPath) {
  this->softwareIdentityEnd.setObjectPath(locateIdentity(objectPath));
}

template <typename Resolver>
void FirmwareAssociation<Resolver>::setUpFromSoftware(const CMPIObjectPath* objectPath) {
  this->elementEnd.setObjectPath(locateComputer(objectPath), false);
}

template <typename Resolver>
CMPIObjectPath* FirmwareAssociation<Resolver>::locateComputer(const CMPIObjectPath* objectPath) {
  const TraceScope scope(this->point(), " objectPath=", objectPath);
  return this->locate(this->table.elementClassName, objectPath,
                      [this](Moniker& firmware) { return this->resolver.getComputerMoniker(firmware); });
}

template <typename Resolver>
CMPIObjectPath* FirmwareAssociation<Resolver>::locateIdentity(const CMPIObjectPath* objectPath) {
  const TraceScope scope(this->point(), " objectPath=", objectPath);
  return this->locate(softwareIdentityClassName, objectPath,
                      [this](Moniker& computer) { return (this->resolver.*firmwareOf_)(computer); });
}

template <typename Resolver>
FirmwareAssociation<Resolver>::operator bool() {
  const TraceScope scope(this->point());
  if (this->isSoftwareGiven()) {
    return static_cast<bool>(this->elementEnd);
  }
  if (this->isElementGiven()) {
    return static_cast<bool>(this->softwareIdentityEnd);
  }
  return this->isAssociationGiven() && this->elementEnd && this->softwareIdentityEnd;
}

template <typename Resolver>
void FirmwareAssociation<Resolver>::operator++() {
  const TraceScope scope(this->point());
  if (this->isSoftwareGiven()) {
    ++this->elementEnd;
  } else if (this->isElementGiven()) {
    ++this->softwareIdentityEnd;
  } else if (this->isAssociationGiven()) {
    ++this->softwareIdentityEnd;
    ++this->elementEnd;
  }
}

}  // namespace Oru::SoftwareInventoryProfileProvider
