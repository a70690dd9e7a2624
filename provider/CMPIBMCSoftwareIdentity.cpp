#include "CMPIBMCSoftwareIdentity.h"

#include <Trace.h>

namespace Oru::SoftwareInventoryProfileProvider {

namespace {

const std::string loggerCMPIBMCSoftwareIdentity(traceCategory);

const AssociationTable association{
    .className = "KELVO_BMCSoftwareIdentity",
    .classId = 117,
    .elementClassName = "KELVO_SPComputerSystem",
    .elementClassId = 119,
    .references = {{{"Antecedent", End::Element}, {"Dependent", End::Software}}},
    .nullTests = NullTests::Path,
    .logger = loggerCMPIBMCSoftwareIdentity,
    .place = CallSite::here(),
};

}  // namespace

CMPIBMCSoftwareIdentity::CMPIBMCSoftwareIdentity(const CMPIBroker* _broker, const CMPIContext* _context,
                                                 const CMPIObjectPath* objectPath)
    : FirmwareAssociation(association, &BMCSoftwareIdentity::getBMCMoniker, _broker, _context, objectPath) {
  const TraceScope scope(loggerCMPIBMCSoftwareIdentity, " _broker=", _broker, " _context=", _context,
                         " objectPath=", objectPath);
  traceVariable(loggerCMPIBMCSoftwareIdentity, "requestedClassId", requestedClassId);
  if (isAssociationGiven()) {
    setUpAssociation(objectPath);
  } else if (isElementGiven()) {
    setUpFromComputer(objectPath);
  } else if (isSoftwareGiven()) {
    setUpFromSoftware(objectPath);
  }
}

CMPIBMCSoftwareIdentity::~CMPIBMCSoftwareIdentity() {
  const TraceScope scope(loggerCMPIBMCSoftwareIdentity);
}

}  // namespace Oru::SoftwareInventoryProfileProvider
