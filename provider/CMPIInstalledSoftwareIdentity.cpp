#include "CMPIInstalledSoftwareIdentity.h"

#include <Oru/Exceptions.h>
#include <Oru/ProviderUtilities.h>
#include <Trace.h>

namespace Oru::SoftwareInventoryProfileProvider {

namespace {

const std::string loggerCMPIInstalledSoftwareIdentity(traceCategory);

const AssociationTable association{
    .className = "KELVO_InstalledSoftwareIdentity",
    .classId = 3,
    .elementClassName = "KELVO_ComputerSystem",
    .elementClassId = 1,
    .references = {{{"System", End::Element}, {"InstalledSoftware", End::Software}}},
    .nullTests = NullTests::PathAndEnds,
    .logger = loggerCMPIInstalledSoftwareIdentity,
    .place = CallSite::here(),
};

}  // namespace

CMPIInstalledSoftwareIdentity::CMPIInstalledSoftwareIdentity(const CMPIBroker* _broker,
                                                             const CMPIContext* _context,
                                                             const CMPIObjectPath* objectPath)
    : AssociationAdapter(association, _broker, _context, objectPath) {
  const TraceScope scope(loggerCMPIInstalledSoftwareIdentity, " _broker=", _broker, " _context=", _context,
                         " objectPath=", objectPath);
  traceVariable(loggerCMPIInstalledSoftwareIdentity, "requestedClassId", requestedClassId);
  if (isSoftwareGiven()) {
    elementEnd.setObjectPath(locateComputer(objectPath), false);
  } else if (isAssociationGiven() && !setObjectPath(objectPath)) {
    throw InstrumentationException("Could not find specified instance");
  }
  // A computer's path narrows nothing: the software end walks every software identity.
}

CMPIInstalledSoftwareIdentity::~CMPIInstalledSoftwareIdentity() {
  const TraceScope scope(loggerCMPIInstalledSoftwareIdentity);
}

bool CMPIInstalledSoftwareIdentity::setObjectPath(const CMPIObjectPath* objectPath) {
  const TraceScope scope(loggerCMPIInstalledSoftwareIdentity, " objectPath=", objectPath);
  return ProviderUtilities::getKeyCount(objectPath) != 0 ? setGivenAssociation(objectPath)
                                                         : setFirstAssociation();
}

/// One association, whose ends must belong together.
bool CMPIInstalledSoftwareIdentity::setGivenAssociation(const CMPIObjectPath* objectPath) {
  singleInstance = true;
  CMPIObjectPath* software = nullptr;
  if (!ProviderUtilities::getKeyProperty(objectPath, "InstalledSoftware", &software)) {
    return false;
  }
  softwareIdentityEnd.setObjectPath(software);
  const CMPIObjectPath* located = locateComputer(software);
  CMPIObjectPath* system = nullptr;
  if (!ProviderUtilities::getKeyProperty(objectPath, "System", &system)) {
    return false;
  }
  std::string givenName;
  std::string locatedName;
  if (!ProviderUtilities::getKeyProperty(system, "Name", givenName) ||
      !ProviderUtilities::getKeyProperty(located, "Name", locatedName) || givenName != locatedName) {
    return false;
  }
  elementEnd.setObjectPath(system, true);
  return true;
}

/// The first computer, and the first software of it.
bool CMPIInstalledSoftwareIdentity::setFirstAssociation() {
  elementEnd.setObjectPath(
      ProviderUtilities::createObjectPath(broker, association.elementClassName, nameSpace), false);
  if (!elementEnd) {
    return false;
  }
  softwareIdentityEnd.setObjectPath(locateIdentity(elementEnd.getObjectPath()));
  return true;
}

CMPIObjectPath* CMPIInstalledSoftwareIdentity::locateComputer(const CMPIObjectPath* objectPath) {
  const TraceScope scope(loggerCMPIInstalledSoftwareIdentity, " objectPath=", objectPath);
  return locate(association.elementClassName, objectPath,
                [this](Moniker& software) { return resolver.getSystemMoniker(software); });
}

CMPIObjectPath* CMPIInstalledSoftwareIdentity::locateIdentity(const CMPIObjectPath* objectPath) {
  const TraceScope scope(loggerCMPIInstalledSoftwareIdentity, " objectPath=", objectPath);
  return locate(softwareIdentityClassName, objectPath,
                [this](Moniker& computer) { return resolver.getSoftwareIdentityMoniker(computer); });
}

CMPIInstalledSoftwareIdentity::operator bool() {
  const TraceScope scope(loggerCMPIInstalledSoftwareIdentity);
  return valid;
}

void CMPIInstalledSoftwareIdentity::operator++() {
  const TraceScope scope(loggerCMPIInstalledSoftwareIdentity);
  if (isSoftwareGiven()) {
    ++elementEnd;
    valid = static_cast<bool>(elementEnd);
  } else if (isElementGiven()) {
    ++softwareIdentityEnd;
    valid = static_cast<bool>(softwareIdentityEnd);
  } else if (!isAssociationGiven() || singleInstance) {
    // A path of any other class has no end to walk: nothing would ever end its nulls.
    valid = false;
  } else {
    // Computers outside, their software inside.
    ++softwareIdentityEnd;
    if (!softwareIdentityEnd) {
      ++elementEnd;
      if (elementEnd) {
        softwareIdentityEnd.setObjectPath(locateIdentity(elementEnd.getObjectPath()));
      }
    }
    // True at the next computer even if it has no software.
    valid = elementEnd || softwareIdentityEnd;
  }
}

}  // namespace Oru::SoftwareInventoryProfileProvider
