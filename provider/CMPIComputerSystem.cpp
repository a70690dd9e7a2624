#include "CMPIComputerSystem.h"

#include <Oru/Exceptions.h>
#include <Oru/ProviderUtilities.h>
#include <Trace.h>
#include <cmpi/cmpimacs.h>

#include <utility>

#include "EndPoint.h"

namespace Oru::SoftwareInventoryProfileProvider {

namespace {

const std::string loggerCMPISIComputerSystem(traceCategory);

ProviderException noInstance() {
  return ProviderException("Could not obtain an instance of Computer System");
}

bool hasNext(CMPIEnumeration* enumeration) {
  return enumeration != nullptr && CMHasNext(enumeration, nullptr) != 0;
}

}  // namespace

CMPISIComputerSystem::CMPISIComputerSystem(const CMPIBroker* _broker, const CMPIContext* _context,
                                           std::string _className)
    : broker(_broker), context(_context), className(std::move(_className)) {
  traceMethod(loggerCMPISIComputerSystem);
}

CMPISIComputerSystem::~CMPISIComputerSystem() {
  traceMethod(loggerCMPISIComputerSystem);
}

// Entry and exit are of the error level here and in getCMPIInstance: they border on another provider. A
// search by name has no exit event.
void CMPISIComputerSystem::setObjectPath(const CMPIObjectPath* path, bool _matchByName) {
  traceEntering(loggerCMPISIComputerSystem, errorLevel, " objectPath=", path);
  matchByName = _matchByName;
  CMPIStatus status{CMPI_RC_OK, nullptr};
  enumeration = CBEnumInstances(broker, context, path, nullptr, &status);
  if (status.rc != CMPI_RC_OK) {
    throw noInstance();
  }
  if (matchByName) {
    findCMM(enumeration, path);
    return;
  }
  if (!hasNext(enumeration)) {
    throw noInstance();
  }
  const CMPIData first = CMGetNext(enumeration, &status);
  if (status.rc != CMPI_RC_OK) {
    throw noInstance();
  }
  currentInstance = first.value.inst;
  valid = true;
  traceExiting(loggerCMPISIComputerSystem, errorLevel, " objectPath=", path);
}

// The enumeration is read to its end also once the instance is found: what follows is ignored.
void CMPISIComputerSystem::findCMM(CMPIEnumeration* instances, const CMPIObjectPath* path) {
  const TraceScope scope(loggerCMPISIComputerSystem);
  std::string key;
  ProviderUtilities::getKeyProperty(path, "Name", key);
  traceVariable(loggerCMPISIComputerSystem, "key", key);
  matchByName = false;
  bool found = false;
  while (hasNext(instances)) {
    CMPIStatus status{CMPI_RC_OK, nullptr};
    const CMPIData next = CMGetNext(instances, &status);
    if (status.rc != CMPI_RC_OK || found) {
      continue;
    }
    currentInstance = next.value.inst;
    std::string value;
    ProviderUtilities::getProperty(currentInstance, "Name", value, false);
    found = value == key;
  }
  if (!found) {
    currentInstance = nullptr;
  }
}

CMPISIComputerSystem::operator bool() {
  const TraceScope scope(loggerCMPISIComputerSystem);
  bool result = false;
  if (valid) {
    valid = false;
    result = true;
  } else if (enumeration != nullptr && currentInstance != nullptr && currentInstance->hdl != nullptr) {
    traceVariable(loggerCMPISIComputerSystem, "\"Inside enumeration\"", "Inside enumeration");
    result = true;
  }
  traceVariable(loggerCMPISIComputerSystem, "valid", result);
  return result;
}

void CMPISIComputerSystem::operator++() {
  const TraceScope scope(loggerCMPISIComputerSystem);
  currentInstance = nextInstance(enumeration);
}

CMPIObjectPath* CMPISIComputerSystem::getObjectPath() {
  const TraceScope scope(loggerCMPISIComputerSystem);
  return pathOfInstance(currentInstance);
}

CMPIInstance* CMPISIComputerSystem::getCMPIInstance(const char** properties) {
  traceEntering(loggerCMPISIComputerSystem, errorLevel, " properties=", static_cast<const void*>(properties));
  traceExiting(loggerCMPISIComputerSystem, errorLevel, " properties=", static_cast<const void*>(properties));
  return currentInstance;
}

}  // namespace Oru::SoftwareInventoryProfileProvider
