#include "CMPINetworkSoftwareIdentity.h"

#include <Oru/ProviderUtilities.h>
#include <Trace.h>

namespace Oru::SoftwareInventoryProfileProvider {

namespace {

const std::string loggerCMPINetworkSoftwareIdentity(traceCategory);

const AssociationTable association{
    .className = "KELVO_NetworkSoftwareIdentity",
    .classId = 35,
    .elementClassName = "KELVO_NetworkPort",
    .elementClassId = 17,
    .references = {{{"Antecedent", End::Software}, {"Dependent", End::Element}}},
    .nullTests = NullTests::None,
    .logger = loggerCMPINetworkSoftwareIdentity,
    .place = CallSite::here(),
};

}  // namespace

CMPINetworkSoftwareIdentity::CMPINetworkSoftwareIdentity(const CMPIBroker* _broker,
                                                         const CMPIContext* _context,
                                                         const CMPIObjectPath* objectPath)
    : AssociationAdapter(association, _broker, _context, objectPath) {
  const TraceScope scope(loggerCMPINetworkSoftwareIdentity, " _broker=", _broker, " _context=", _context,
                         " objectPath=", objectPath);
  traceVariable(loggerCMPINetworkSoftwareIdentity, "requestedClassId", requestedClassId);
  if (isElementGiven()) {
    softwareIdentityEnd.setObjectPath(locateIdentity(objectPath));
  } else if (isAssociationGiven()) {
    // The port is that of the device, not of the first firmware that is found there.
    const CMPIObjectPath* device = locateIdentity(objectPath);
    softwareIdentityEnd.setObjectPath(device);
    elementEnd.setObjectPath(locateNetwork(device));
  } else if (isSoftwareGiven()) {
    elementEnd.setObjectPath(locateNetwork(objectPath));
  }
}

CMPINetworkSoftwareIdentity::~CMPINetworkSoftwareIdentity() {
  const TraceScope scope(loggerCMPINetworkSoftwareIdentity);
}

CMPIObjectPath* CMPINetworkSoftwareIdentity::locateNetwork(const CMPIObjectPath* objectPath) {
  const TraceScope scope(loggerCMPINetworkSoftwareIdentity, " objectPath=", objectPath);
  return locate(association.elementClassName, objectPath,
                [this](Moniker& software) { return resolver.getNetworkPortMoniker(software); });
}

CMPIObjectPath* CMPINetworkSoftwareIdentity::locateIdentity(const CMPIObjectPath* objectPath) {
  const TraceScope scope(loggerCMPINetworkSoftwareIdentity, " objectPath=", objectPath);
  // Unlike the other ways to locate an end, this one resolves a path without keys, too.
  CMPIObjectPath* located = ProviderUtilities::createObjectPath(broker, softwareIdentityClassName, nameSpace);
  if (ProviderUtilities::getKeyCount(objectPath) == 0) {
    return withKeys(located, resolver.getSoftwareIdentityMoniker());
  }
  Moniker port;
  ProviderUtilities::transformObjectPathToMoniker(objectPath, port);
  return withKeys(located, resolver.getSoftwareIdentityMoniker(port));
}

CMPINetworkSoftwareIdentity::operator bool() {
  const TraceScope scope(loggerCMPINetworkSoftwareIdentity);
  if (isElementGiven()) {
    return static_cast<bool>(softwareIdentityEnd);
  }
  if (isSoftwareGiven()) {
    return static_cast<bool>(elementEnd);
  }
  return isAssociationGiven() && (elementEnd || softwareIdentityEnd);
}

void CMPINetworkSoftwareIdentity::operator++() {
  const TraceScope scope(loggerCMPINetworkSoftwareIdentity);
  if (isElementGiven()) {
    ++softwareIdentityEnd;
  } else if (isSoftwareGiven()) {
    ++elementEnd;
  } else if (isAssociationGiven()) {
    ++elementEnd;
    if (!elementEnd) {
      ++softwareIdentityEnd;
      if (softwareIdentityEnd) {
        elementEnd.setObjectPath(locateNetwork(softwareIdentityEnd.getObjectPath()));
      }
    }
  }
}

}  // namespace Oru::SoftwareInventoryProfileProvider
