#include "CMPIBIOSSoftwareIdentity.h"

#include <Trace.h>

namespace Oru::SoftwareInventoryProfileProvider {

namespace {

const std::string loggerCMPIBIOSSoftwareIdentity(traceCategory);

const AssociationTable association{
    .className = "KELVO_BIOSSoftwareIdentity",
    .classId = 118,
    .elementClassName = "KELVO_ComputerSystem",
    .elementClassId = 1,
    .references = {{{"Antecedent", End::Element}, {"Dependent", End::Software}}},
    .nullTests = NullTests::Path,
    .logger = loggerCMPIBIOSSoftwareIdentity,
    .place = CallSite::here(),
};

}  // namespace

CMPIBIOSSoftwareIdentity::CMPIBIOSSoftwareIdentity(const CMPIBroker* _broker, const CMPIContext* _context,
                                                   const CMPIObjectPath* objectPath)
    : FirmwareAssociation(association, &BIOSSoftwareIdentity::getBIOSMoniker, _broker, _context, objectPath) {
  const TraceScope scope(loggerCMPIBIOSSoftwareIdentity, " _broker=", _broker, " _context=", _context,
                         " objectPath=", objectPath);
  traceVariable(loggerCMPIBIOSSoftwareIdentity, "requestedClassId", requestedClassId);
  if (isSoftwareGiven()) {
    setUpFromSoftware(objectPath);
  } else if (isAssociationGiven()) {
    setUpAssociation(objectPath);
  } else if (isElementGiven()) {
    setUpFromComputer(objectPath);
  }
}

CMPIBIOSSoftwareIdentity::~CMPIBIOSSoftwareIdentity() {
  const TraceScope scope(loggerCMPIBIOSSoftwareIdentity);
}

}  // namespace Oru::SoftwareInventoryProfileProvider
