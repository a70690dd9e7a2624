// The association KELVO_InstalledSoftwareIdentity: software and the computer system it is installed on.
#pragma once

#include <cmpi/cmpidt.h>

#include "AssociationAdapter.h"
#include "CMPIComputerSystem.h"
#include "Linux/InstalledSoftwareIdentity.h"

namespace Oru::SoftwareInventoryProfileProvider {

/// The reference System holds a KELVO_ComputerSystem, InstalledSoftware a KELVO_SoftwareIdentity.
///
/// From software the walk is over its computer, from a computer over every software identity there is: the
/// keys of a computer's path narrow nothing. From the association class without keys it is nested, computers
/// outside, the software of each inside; an association path with keys yields that one association.
class CMPIInstalledSoftwareIdentity
    : public AssociationAdapter<CMPISIComputerSystem, InstalledSoftwareIdentity> {
 public:
  /// Throws `Oru::InstrumentationException` "Could not find specified instance" for an association path whose
  /// ends are not both there and do not belong together, and for the class where no computer is found; and
  /// what the resolver and the ends throw.
  CMPIInstalledSoftwareIdentity(const CMPIBroker* broker, const CMPIContext* context,
                                const CMPIObjectPath* objectPath);
  ~CMPIInstalledSoftwareIdentity();
  CMPIInstalledSoftwareIdentity(const CMPIInstalledSoftwareIdentity&) = delete;
  CMPIInstalledSoftwareIdentity& operator=(const CMPIInstalledSoftwareIdentity&) = delete;

  /// True from the start, whatever the ends hold: the first result is always asked for. After that what the
  /// last step found.
  explicit operator bool();
  void operator++();

  /// Positions both ends from an association path. False where they cannot be, or do not belong together.
  bool setObjectPath(const CMPIObjectPath* objectPath);

  /// From a software path to the path of its computer.
  CMPIObjectPath* locateComputer(const CMPIObjectPath* objectPath);
  /// From a computer's path to the path that selects the software below it.
  CMPIObjectPath* locateIdentity(const CMPIObjectPath* objectPath);

 private:
  bool setGivenAssociation(const CMPIObjectPath* objectPath);
  bool setFirstAssociation();

  bool valid = true;
  bool singleInstance = false;
};

}  // namespace Oru::SoftwareInventoryProfileProvider
