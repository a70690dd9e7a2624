// One kind of system firmware and its computer system: the design that the resolvers of the management
// controller's firmware and of the BIOS share.
//
// A firmware element is a node of type 3, told apart by its description; the computer system is a node of
// sensor type 40 somewhere above it.
#pragma once

#include <Oru/Instrumentation.h>
#include <Oru/Moniker.h>
#include <Trace.h>

namespace Oru::SoftwareInventoryProfileProvider {

/// All that sets one kind of firmware apart.
struct FirmwareKind {
  const char* description;  ///< of its node, exactly
  // What is said where something is missing.
  const char* noFirmware;
  const char* noComputerAboveFirmware;
  const char* otherComputer;
  const char* wrongKind;
  const char* noComputerAboveParent;
};

/// From a computer system (key Name) to its firmware (key InstanceID). Only the first firmware of the kind is
/// considered: where it belongs to another computer, none is found.
Moniker firmwareOfComputer(Instrumentation& tree, const FirmwareKind& kind, Moniker& computer,
                           const LogPoint& point);

/// From firmware of the kind (key InstanceID) to the computer system above the parent that the InstanceID
/// names (key Name).
Moniker computerOfFirmware(Instrumentation& tree, const FirmwareKind& kind, Moniker& identity,
                           const LogPoint& point);

}  // namespace Oru::SoftwareInventoryProfileProvider
