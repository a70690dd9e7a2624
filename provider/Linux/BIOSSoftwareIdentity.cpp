#include "Linux/BIOSSoftwareIdentity.h"

#include <Trace.h>

#include "Linux/FirmwareResolution.h"

namespace Oru::SoftwareInventoryProfileProvider {

namespace {

const std::string loggerBIOSSoftwareIdentity(traceCategory);

constexpr FirmwareKind kind{
    .description = "BIOS",
    .noFirmware = "Could not find BIOS firmware",
    .noComputerAboveFirmware = "Could not find Computer associated with BIOS",
    .otherComputer = "A BIOS associated with this computer is not available.",
    .wrongKind = "The specified firmware is not a BIOS firmware",
    .noComputerAboveParent = "Could not find BIOS Computer System",
};

}  // namespace

BIOSSoftwareIdentity::BIOSSoftwareIdentity() {
  traceMethod(loggerBIOSSoftwareIdentity);
}

BIOSSoftwareIdentity::~BIOSSoftwareIdentity() {
  traceMethod(loggerBIOSSoftwareIdentity);
}

Moniker BIOSSoftwareIdentity::getBIOSMoniker(Moniker& monikerComputer) {
  const ParameterScope scope(loggerBIOSSoftwareIdentity, " monikerComputer=", monikerComputer);
  return firmwareOfComputer(*this, kind, monikerComputer, loggerBIOSSoftwareIdentity);
}

Moniker BIOSSoftwareIdentity::getComputerMoniker(Moniker& monikerBIOSIdentity) {
  const ParameterScope scope(loggerBIOSSoftwareIdentity, " monikerBIOSIdentity=", monikerBIOSIdentity);
  return computerOfFirmware(*this, kind, monikerBIOSIdentity, loggerBIOSSoftwareIdentity);
}

}  // namespace Oru::SoftwareInventoryProfileProvider
