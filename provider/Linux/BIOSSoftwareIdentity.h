// Which system firmware a computer system has, and which computer system that firmware belongs to.
#pragma once

#include <Oru/Instrumentation.h>
#include <Oru/Moniker.h>

namespace Oru::SoftwareInventoryProfileProvider {

/// A cursor that each operation selects anew and leaves where its walk ended. Arguments are read alone, but
/// for their key selection. Operations throw `Oru::InstrumentationException` and `Oru::FrameworkException`.
class BIOSSoftwareIdentity : public Instrumentation {
 public:
  BIOSSoftwareIdentity();
  ~BIOSSoftwareIdentity();

  /// From a computer system (key Name) to its firmware "BIOS" (key InstanceID). The first such firmware of
  /// the machine alone is considered.
  Moniker getBIOSMoniker(Moniker& monikerComputer);

  /// From that firmware (key InstanceID) to the computer system above it (key Name).
  Moniker getComputerMoniker(Moniker& monikerBIOSIdentity);
};

}  // namespace Oru::SoftwareInventoryProfileProvider
