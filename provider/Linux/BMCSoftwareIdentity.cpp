#include "Linux/BMCSoftwareIdentity.h"

#include <Trace.h>

#include "Linux/FirmwareResolution.h"

namespace Oru::SoftwareInventoryProfileProvider {

namespace {

const std::string loggerBMCSoftwareIdentity(traceCategory);

constexpr FirmwareKind kind{
    .description = "BMC Firmware",
    .noFirmware = "Could not find BMC firmware",
    .noComputerAboveFirmware = "Could not find Computer associated with BMC",
    .otherComputer = "A BMC associated with this computer is not available.",
    .wrongKind = "The specified firmware is not a BMC firmware",
    .noComputerAboveParent = "Could not find BMC Computer System",
};

}  // namespace

BMCSoftwareIdentity::BMCSoftwareIdentity() {
  traceMethod(loggerBMCSoftwareIdentity);
}

BMCSoftwareIdentity::~BMCSoftwareIdentity() {
  traceMethod(loggerBMCSoftwareIdentity);
}

Moniker BMCSoftwareIdentity::getBMCMoniker(Moniker& monikerComputer) {
  const ParameterScope scope(loggerBMCSoftwareIdentity, " monikerComputer=", monikerComputer);
  return firmwareOfComputer(*this, kind, monikerComputer, loggerBMCSoftwareIdentity);
}

Moniker BMCSoftwareIdentity::getComputerMoniker(Moniker& monikerBMCIdentity) {
  const ParameterScope scope(loggerBMCSoftwareIdentity, " monikerBMCIdentity=", monikerBMCIdentity);
  return computerOfFirmware(*this, kind, monikerBMCIdentity, loggerBMCSoftwareIdentity);
}

}  // namespace Oru::SoftwareInventoryProfileProvider
