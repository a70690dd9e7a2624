#include "Linux/InstalledSoftwareIdentity.h"

#include <Trace.h>

#include "Linux/InstanceId.h"
#include "Linux/Resolution.h"

namespace Oru::SoftwareInventoryProfileProvider {

namespace {
const std::string loggerInstalledSoftwareIdentity(traceCategory);
}

InstalledSoftwareIdentity::InstalledSoftwareIdentity() {
  traceMethod(loggerInstalledSoftwareIdentity);
}

InstalledSoftwareIdentity::~InstalledSoftwareIdentity() {
  traceMethod(loggerInstalledSoftwareIdentity);
}

Moniker InstalledSoftwareIdentity::getSoftwareIdentityMoniker(Moniker& moniker) {
  const LogPoint point(loggerInstalledSoftwareIdentity);
  return withExceptionList([&] {
    const ParameterScope scope(point, " moniker=", moniker);
    const auto nameComputer = findKey(moniker, nameKey);
    if (!nameComputer) {
      throw FrameworkException("Could not find 'Name' component in Moniker");
    }
    traceVariable(point, "nameComputer", *nameComputer);

    // A computer without a readable name ends the search as the one that is looked for.
    selectNode(NodeLexicon::ComputerSystemNode);
    std::string name;
    while (getProperty(NodeLexicon::NameProperty, name) && name != *nameComputer) {
      ++*this;
      if (!*this) {
        throw InstrumentationException("Concerned Computer Could Not Be Found.");
      }
    }
    const std::string instanceId = nodeNumber(convertPathToString(getPathToNode()));
    traceVariable(point, "instanceId", instanceId);
    return monikerOf(instanceIdKey, instanceId);
  });
}

Moniker InstalledSoftwareIdentity::getSystemMoniker(Moniker& identityMoniker) {
  const LogPoint point(loggerInstalledSoftwareIdentity);
  return withExceptionList([&] {
    const ParameterScope scope(point, " identityMoniker=", identityMoniker);
    const auto instanceId = findKey(identityMoniker, instanceIdKey);
    if (!instanceId) {
      throw FrameworkException("Could not find 'InstanceId' component in Moniker");
    }
    traceVariable(point, "instanceId", *instanceId);

    selectNode(convertStringToPath(std::string(parseInstanceId(*instanceId).pathText)));
    if (!*this || !climbToComputer(*this)) {
      throw InstrumentationException("Instrumentation node not available.");
    }
    std::string nameComputer;
    if (!getProperty(NodeLexicon::NameProperty, nameComputer)) {
      throw InstrumentationException("Name Property on computer not available.");
    }
    traceVariable(point, "nameComputer", nameComputer);
    return monikerOf(nameKey, nameComputer);
  });
}

}  // namespace Oru::SoftwareInventoryProfileProvider
