#include "Linux/NetworkSoftwareIdentity.h"

#include <Trace.h>

#include "Linux/InstanceId.h"
#include "Linux/Resolution.h"

namespace Oru::SoftwareInventoryProfileProvider {

namespace {
const std::string loggerNetworkSoftwareIdentity(traceCategory);
}

NetworkSoftwareIdentity::NetworkSoftwareIdentity() {
  traceMethod(loggerNetworkSoftwareIdentity);
}

NetworkSoftwareIdentity::~NetworkSoftwareIdentity() {
  traceMethod(loggerNetworkSoftwareIdentity);
}

Moniker NetworkSoftwareIdentity::getSoftwareIdentityMoniker() {
  const LogPoint point(loggerNetworkSoftwareIdentity);
  return withExceptionList([&] {
    const TraceScope scope(point);
    // Whether there is a device at all is not asked.
    selectNode(NodeLexicon::NetworkDeviceNode);
    return monikerOf(instanceIdKey, nodeNumber(convertPathToString(getPathToNode())));
  });
}

Moniker NetworkSoftwareIdentity::getSoftwareIdentityMoniker(Moniker& monikerNetwork) {
  const LogPoint point(loggerNetworkSoftwareIdentity);
  return withExceptionList([&] {
    const TraceScope scope(point, " monikerNetwork=", monikerNetwork);
    const auto deviceId = findKey(monikerNetwork, deviceIdKey);
    if (!deviceId) {
      throw FrameworkException("Could not find 'DeviceId' Key in Moniker");
    }
    traceVariable(point, "deviceId", *deviceId);

    selectNode(NodeLexicon::NetworkPortNode);
    std::string name;
    for (;;) {
      if (!*this) {
        throw InstrumentationException("Specified Network Port not found.");
      }
      if (getProperty(NodeLexicon::NameProperty, name) && name == *deviceId) {
        break;
      }
      ++*this;
    }
    return monikerOf(instanceIdKey, nodeNumber(convertPathToString(getPathToParentNode())));
  });
}

Moniker NetworkSoftwareIdentity::getNetworkPortMoniker(Moniker& monikerIdentity) {
  const LogPoint point(loggerNetworkSoftwareIdentity);
  return withExceptionList([&] {
    const TraceScope scope(point, " monikerIdentity=", monikerIdentity);
    const auto instanceId = findKey(monikerIdentity, instanceIdKey);
    if (!instanceId) {
      throw FrameworkException("Could not find 'InstanceId' key in Moniker");
    }
    traceVariable(point, "instanceId", *instanceId);

    const std::string device = convertStringToPath(parentPathText(*instanceId));
    selectNode(device);
    if (getSensorType() != NodeLexicon::NetworkDeviceNode) {
      throw InstrumentationException("The specified firmware does not belong to a network device");
    }
    // A device without ports shows as a port without a name.
    selectNode(NodeLexicon::NetworkPortNode);
    setFilter(NodeLexicon::ParentPath, device);
    std::string deviceId;
    if (!getProperty(NodeLexicon::NameProperty, deviceId)) {
      throw InstrumentationException("Could not extract DeviceID Property.");
    }
    return monikerOf(deviceIdKey, deviceId);
  });
}

}  // namespace Oru::SoftwareInventoryProfileProvider
