// Which firmware a computer system's management controller runs, and which computer system that firmware
// belongs to.
#pragma once

#include <Oru/Instrumentation.h>
#include <Oru/Moniker.h>

namespace Oru::SoftwareInventoryProfileProvider {

/// A cursor that each operation selects anew and leaves where its walk ended. Arguments are read alone, but
/// for their key selection. Operations throw `Oru::InstrumentationException` and `Oru::FrameworkException`.
class BMCSoftwareIdentity : public Instrumentation {
 public:
  BMCSoftwareIdentity();
  ~BMCSoftwareIdentity();

  /// From a computer system (key Name) to its firmware "BMC Firmware" (key InstanceID). The first such
  /// firmware of the machine alone is considered.
  Moniker getBMCMoniker(Moniker& monikerComputer);

  /// From that firmware (key InstanceID) to the computer system above it (key Name).
  Moniker getComputerMoniker(Moniker& monikerBMCIdentity);
};

}  // namespace Oru::SoftwareInventoryProfileProvider
