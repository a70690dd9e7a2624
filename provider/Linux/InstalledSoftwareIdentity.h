// Which software a computer system has, and which computer system software is installed on.
#pragma once

#include <Oru/Instrumentation.h>
#include <Oru/Moniker.h>

namespace Oru::SoftwareInventoryProfileProvider {

/// A cursor that each operation selects anew and leaves where its walk ended. Arguments are read alone, but
/// for their key selection. Operations throw `Oru::InstrumentationException` and `Oru::FrameworkException`;
/// any other exception that comes out of them ends the process.
class InstalledSoftwareIdentity : public Instrumentation {
 public:
  InstalledSoftwareIdentity();
  ~InstalledSoftwareIdentity();

  /// From a computer system (key Name) to the software below it: the key InstanceID is the computer's node
  /// number. A computer without a readable name counts as the one that is looked for.
  Moniker getSoftwareIdentityMoniker(Moniker& moniker);

  /// From software (key InstanceID) to the computer system above it (key Name).
  Moniker getSystemMoniker(Moniker& identityMoniker);
};

}  // namespace Oru::SoftwareInventoryProfileProvider
