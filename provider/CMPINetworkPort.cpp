#include "CMPINetworkPort.h"

#include <Oru/Exceptions.h>
#include <Trace.h>
#include <cmpi/cmpimacs.h>

#include <utility>

#include "EndPoint.h"

namespace Oru::SoftwareInventoryProfileProvider {

namespace {

const std::string loggerCMPISINetworkPort(traceCategory);

/// A path in a parameter list: its text as the object manager has it. It is asked for where it is printed.
struct PathText {
  const CMPIObjectPath* path;
};

std::ostream& operator<<(std::ostream& list, PathText text) {
  const CMPIString* whole = text.path != nullptr && text.path->ft->toString != nullptr
                                ? CMObjectPathToString(text.path, nullptr)
                                : nullptr;
  const char* chars = whole != nullptr ? CMGetCharsPtr(whole, nullptr) : nullptr;
  return list << trace_detail::orNull(chars);
}

}  // namespace

CMPISINetworkPort::CMPISINetworkPort(const CMPIBroker* _broker, const CMPIContext* _context,
                                     std::string _nameSpace)
    : broker(_broker), context(_context), nameSpace(std::move(_nameSpace)) {
  traceMethod(loggerCMPISINetworkPort);
}

CMPISINetworkPort::~CMPISINetworkPort() {
  traceMethod(loggerCMPISINetworkPort);
}

void CMPISINetworkPort::setObjectPath(const CMPIObjectPath* objectPath) {
  const TraceScope scope(loggerCMPISINetworkPort, " objectPath=", PathText{objectPath});
  CMPIStatus status{CMPI_RC_OK, nullptr};
  enumeration = CBEnumInstances(broker, context, objectPath, nullptr, &status);
  if (status.rc == CMPI_RC_OK && enumeration != nullptr && CMHasNext(enumeration, &status) != 0) {
    const CMPIData first = CMGetNext(enumeration, &status);
    if (status.rc == CMPI_RC_OK) {
      currentInstance = first.value.inst;
      firstPending = true;
      return;
    }
  }
  throw ProviderException("Could not obtain an instance of Network Port");
}

CMPISINetworkPort::operator bool() {
  const TraceScope scope(loggerCMPISINetworkPort);
  if (firstPending) {
    firstPending = false;
    return true;
  }
  CMPIStatus status{CMPI_RC_OK, nullptr};
  return enumeration != nullptr && CMHasNext(enumeration, &status) == 1;
}

void CMPISINetworkPort::operator++() {
  const TraceScope scope(loggerCMPISINetworkPort);
  currentInstance = nextInstance(enumeration);
}

CMPIObjectPath* CMPISINetworkPort::getObjectPath() {
  const TraceScope scope(loggerCMPISINetworkPort);
  return pathOfInstance(currentInstance);
}

CMPIInstance* CMPISINetworkPort::getCMPIInstance(const char** properties) {
  const void* const list = static_cast<const void*>(properties);
  const ParameterScope scope(loggerCMPISINetworkPort, " properties=", list);
  return currentInstance;
}

}  // namespace Oru::SoftwareInventoryProfileProvider
