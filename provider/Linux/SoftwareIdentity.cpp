#include "Linux/SoftwareIdentity.h"

#include <Oru/Exceptions.h>
#include <Trace.h>

#include <ctime>
#include <utility>

namespace Oru::SoftwareInventoryProfileProvider {

namespace {

const std::string loggerSoftwareIdentity(traceCategory);

bool contains(const std::string& text, const char* part) {
  return text.find(part) != std::string::npos;
}

/// What every getter of a property that is never published does.
bool neverPublished(CallSite site = CallSite::here()) {
  const TraceScope scope(LogPoint(loggerSoftwareIdentity, site));
  return false;
}

}  // namespace

const std::vector<NodeLexicon::NodeType> SoftwareIdentity::nodeTypes{
    NodeLexicon::FirmwareNode, NodeLexicon::BiosNode, NodeLexicon::DriverNode};

SoftwareIdentity::SoftwareIdentity() : currentNodeType(nodeTypes.begin()) {
  const TraceScope scope(loggerSoftwareIdentity);
  while (currentNodeType != nodeTypes.end() && !selectCurrentNodeType()) {
    ++currentNodeType;
  }
  if (currentNodeType == nodeTypes.end()) {
    throw InstrumentationException("Could Not Find Any of the Software Identity Nodes");
  }
}

SoftwareIdentity::~SoftwareIdentity() {
  const TraceScope scope(loggerSoftwareIdentity);
}

/// Starts on the nodes of the current type, under the filter. False where there are none: a framework says so
/// by an exception or by a cursor on no node.
bool SoftwareIdentity::selectCurrentNodeType() {
  try {
    instrumentation.selectNode(*currentNodeType);
    if (!instrumentation) {
      return false;
    }
    if (filterActive) {
      instrumentation.setFilter(pathType, filterPath);
    }
    return true;
  } catch (const InstrumentationException&) {
    return false;
  }
}

// NOLINTNEXTLINE(performance-unnecessary-value-param): callers hand over a copy of their own
void SoftwareIdentity::setFilter(FilterType type, std::string value) {
  const TraceScope scope(loggerSoftwareIdentity, " filterType=", static_cast<unsigned int>(type),
                         " reference=", value);
  filterActive = true;
  if (value.find('@') != std::string::npos) {
    traceMessage(loggerSoftwareIdentity, "Complete Path has been passed");
    const std::string pathText(parseInstanceId(value).pathText);
    // The framework's filter is for the types that follow: on the current type nodes are compared one by one.
    filterPath = instrumentation.convertStringToPath(pathText);
    pathType = NodeLexicon::ExactPath;
    filters.push_back({type, pathText});
    bool matched = false;
    while (areNodeAvailable() && !matched) {
      matched = evaluate();
      if (!matched) {
        forwardInstrumentation();
      }
    }
    return;
  }

  traceMessage(loggerSoftwareIdentity, "Parent Id has been passed.");
  const std::string parentPath = instrumentation.convertStringToPath(parentPathText(value));
  if (parentPath == instrumentation.getPathToComputer()) {
    traceMessage(loggerSoftwareIdentity, "Applied Computer Path Filter");
    pathType = NodeLexicon::ComputerPath;
  } else {
    traceMessage(loggerSoftwareIdentity, "Applied Parent Path Filter");
    pathType = NodeLexicon::ParentPath;
  }
  instrumentation.setFilter(pathType, parentPath);
  filterPath = parentPath;
}

bool SoftwareIdentity::evaluate() {
  const TraceScope scope(loggerSoftwareIdentity);
  for (const Filter& filter : filters) {
    if (filter.type == InstanceIdFilter &&
        instrumentation.convertPathToString(instrumentation.getPathToNode()) != filter.value) {
      return false;
    }
  }
  return true;
}

void SoftwareIdentity::forwardInstrumentation() {
  const TraceScope scope(loggerSoftwareIdentity);
  ++instrumentation;
  if (instrumentation) {
    return;
  }
  // An exhausted walk stays exhausted: there is no type after the last.
  while (currentNodeType != nodeTypes.end()) {
    ++currentNodeType;
    if (currentNodeType != nodeTypes.end() && selectCurrentNodeType()) {
      return;
    }
  }
}

bool SoftwareIdentity::areNodeAvailable() {
  const TraceScope scope(loggerSoftwareIdentity);
  return static_cast<bool>(instrumentation) || currentNodeType != nodeTypes.end();
}

SoftwareIdentity::operator bool() {
  const TraceScope scope(loggerSoftwareIdentity);
  return areNodeAvailable();
}

void SoftwareIdentity::operator++() {
  const TraceScope scope(loggerSoftwareIdentity);
  do {
    forwardInstrumentation();
  } while (filterActive && areNodeAvailable() && !evaluate());
}

/// The type whose nodes the walk is on; none of the listed once all are exhausted.
int SoftwareIdentity::currentType() const {
  return currentNodeType != nodeTypes.end() ? *currentNodeType : 0;
}

bool SoftwareIdentity::getName(std::string& name) {
  const TraceScope scope(loggerSoftwareIdentity);
  return instrumentation.getProperty(NodeLexicon::NameProperty, name);
}

bool SoftwareIdentity::getManufacturer(std::string& manufacturer) {
  const TraceScope scope(loggerSoftwareIdentity);
  return instrumentation.getProperty(NodeLexicon::ManufacturerProperty, manufacturer);
}

bool SoftwareIdentity::getBuildId(std::string& buildId) {
  const TraceScope scope(loggerSoftwareIdentity);
  return instrumentation.getProperty(NodeLexicon::BuildIdProperty, buildId);
}

bool SoftwareIdentity::getMajorVersion(unsigned short& majorVersion) {
  const TraceScope scope(loggerSoftwareIdentity);
  return getVersionNumber(NodeLexicon::MajorVersionProperty, majorVersion);
}

bool SoftwareIdentity::getMinorVersion(unsigned short& minorVersion) {
  const TraceScope scope(loggerSoftwareIdentity);
  return getVersionNumber(NodeLexicon::MinorVersionProperty, minorVersion);
}

bool SoftwareIdentity::getVersionNumber(NodeLexicon::Properties property, unsigned short& number) {
  unsigned int wide = 0;
  const bool available = instrumentation.getProperty(property, wide);
  number = static_cast<unsigned short>(wide & 0xffffU);
  return available;
}

bool SoftwareIdentity::getVersionString(std::string& versionString) {
  const TraceScope scope(loggerSoftwareIdentity);
  NodeLexicon::Properties property = NodeLexicon::VersionStringProperty;
  if (currentType() == NodeLexicon::FirmwareNode) {
    if (firmwareKind().hasFirmwareRevision) {
      property = NodeLexicon::FirmwareRevisionProperty;
    }
  } else if (currentType() == NodeLexicon::DriverNode) {
    property = NodeLexicon::DriverVersionProperty;
  }
  return instrumentation.getProperty(property, versionString);
}

bool SoftwareIdentity::getDescription(std::string& description) {
  const TraceScope scope(loggerSoftwareIdentity);
  // Copied into the room that is there: taking over the text's own would give up room that later texts need.
  description.assign(static_cast<const std::string&>(instrumentation.getNodeDescription()));
  std::string name;
  if (instrumentation.getProperty(NodeLexicon::NameProperty, name) && contains(name, "Velmor2")) {
    description = "Orsella Controller II Firmware";
  }
  return true;
}

bool SoftwareIdentity::getReleaseDate(std::string& releaseDate) {
  const TraceScope scope(loggerSoftwareIdentity);
  if (!instrumentation.getProperty(NodeLexicon::ReleaseDateProperty, releaseDate)) {
    return false;
  }
  const std::string_view formatted = dateBuffer.format(releaseDate, timezone);
  releaseDate.assign(formatted);
  return !formatted.empty();
}

bool SoftwareIdentity::getInstallDate(std::string& installDate) {
  const TraceScope scope(loggerSoftwareIdentity);
  return getReleaseDate(installDate);
}

/// An instance asks three times about its description, and many have the same: it is searched once for a row.
/// The order of the tests decides for descriptions that name more than one kind.
const SoftwareIdentity::FirmwareKind& SoftwareIdentity::firmwareKind() {
  std::string description = instrumentation.getNodeDescription();
  if (description == lastFirmwareKind.description) {
    return lastFirmwareKind;
  }
  FirmwareKind kind;
  kind.hasFirmwareRevision = contains(description, "FPGA Firmware") || contains(description, "Baseboard");
  if (contains(description, "BIOS") || contains(description, "UEFI")) {
    kind.classification = {11, "BIOS/FCode"};
  } else if (contains(description, "Diagnostic")) {
    kind.classification = {7, "Diagnostic Software"};
  }
  kind.description = std::move(description);
  lastFirmwareKind = std::move(kind);
  return lastFirmwareKind;
}

SoftwareIdentity::Classification SoftwareIdentity::classify() {
  switch (currentType()) {
    case NodeLexicon::BiosNode:
      return {11, "BIOS/FCode"};
    case NodeLexicon::FirmwareNode:
      return firmwareKind().classification;
    case NodeLexicon::ApplicationSoftwareNode:
      return {4, "Application Software"};
    case NodeLexicon::DriverNode:
      return {2, "Driver"};
    default:
      return {0, "Unknown"};
  }
}

bool SoftwareIdentity::getClassifications(std::vector<unsigned short>& classifications) {
  const TraceScope scope(loggerSoftwareIdentity);
  classifications.push_back(classify().value);
  return true;
}

bool SoftwareIdentity::getClassificationDescriptions(std::vector<std::string>& descriptions) {
  const TraceScope scope(loggerSoftwareIdentity);
  descriptions.emplace_back(classify().description);
  return true;
}

// Half of what a name costs above its calls: put together in one place.
[[gnu::flatten]] bool SoftwareIdentity::getInstanceID(std::string& instanceId) {
  const TraceScope scope(loggerSoftwareIdentity);
  const std::string parent = instrumentation.convertPathToString(instrumentation.getPathToParentNode());
  const std::string node = instrumentation.convertPathToString(instrumentation.getPathToNode());
  instanceIds.make(parent, node, instanceId);
  return true;
}

bool SoftwareIdentity::modifyElementSoftwareStatus(const std::vector<unsigned short>& status) {
  const TraceScope scope(loggerSoftwareIdentity);
  return instrumentation.setProperty(NodeLexicon::ElementSoftwareStatusProperty,
                                     {status.begin(), status.end()});
}

bool SoftwareIdentity::getCaption(std::string&) {
  return neverPublished();
}
bool SoftwareIdentity::getElementName(std::string&) {
  return neverPublished();
}
bool SoftwareIdentity::getOperationalStatus(std::vector<unsigned short>&) {
  return neverPublished();
}
bool SoftwareIdentity::getStatusDescriptions(std::vector<std::string>&) {
  return neverPublished();
}
bool SoftwareIdentity::getHealthState(unsigned short&) {
  return neverPublished();
}
bool SoftwareIdentity::getPrimaryStatus(unsigned short&) {
  return neverPublished();
}
bool SoftwareIdentity::getDetailedStatus(unsigned short&) {
  return neverPublished();
}
bool SoftwareIdentity::getOperatingStatus(unsigned short&) {
  return neverPublished();
}
bool SoftwareIdentity::getCommunicationStatus(unsigned short&) {
  return neverPublished();
}
bool SoftwareIdentity::getRevisionNumber(unsigned short&) {
  return neverPublished();
}
bool SoftwareIdentity::getBuildNumber(unsigned short&) {
  return neverPublished();
}
bool SoftwareIdentity::getTargetOperatingSystems(std::vector<std::string>&) {
  return neverPublished();
}
bool SoftwareIdentity::getLanguages(std::vector<std::string>&) {
  return neverPublished();
}
bool SoftwareIdentity::getSerialNumber(std::string&) {
  return neverPublished();
}
bool SoftwareIdentity::getTargetTypes(std::vector<std::string>&) {
  return neverPublished();
}
bool SoftwareIdentity::getIdentityInfoValue(std::vector<std::string>&) {
  return neverPublished();
}
bool SoftwareIdentity::getIdentityInfoType(std::vector<std::string>&) {
  return neverPublished();
}
bool SoftwareIdentity::isEntity(bool&) {
  return neverPublished();
}
bool SoftwareIdentity::getExtendedResourceType(unsigned short&) {
  return neverPublished();
}
bool SoftwareIdentity::getOtherExtendedResourceTypeDescription(std::string&) {
  return neverPublished();
}
bool SoftwareIdentity::getMinExtendedResourceTypeMajorVersion(unsigned short&) {
  return neverPublished();
}
bool SoftwareIdentity::getMinExtendedResourceTypeMinorVersion(unsigned short&) {
  return neverPublished();
}
bool SoftwareIdentity::getMinExtendedResourceTypeRevisionNumber(unsigned short&) {
  return neverPublished();
}
bool SoftwareIdentity::getMinExtendedResourceTypeBuildNumber(unsigned short&) {
  return neverPublished();
}
bool SoftwareIdentity::getTargetOSTypes(std::vector<unsigned short>&) {
  return neverPublished();
}

}  // namespace Oru::SoftwareInventoryProfileProvider
