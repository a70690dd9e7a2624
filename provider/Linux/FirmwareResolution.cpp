#include "Linux/FirmwareResolution.h"

#include "Linux/InstanceId.h"
#include "Linux/Resolution.h"

namespace Oru::SoftwareInventoryProfileProvider {

namespace {

std::string nameOfComputer(Instrumentation& computer) {
  std::string name;
  if (!computer.getProperty(NodeLexicon::NameProperty, name)) {
    throw InstrumentationException("Name Property on computer not available.");
  }
  return name;
}

}  // namespace

Moniker firmwareOfComputer(Instrumentation& tree, const FirmwareKind& kind, Moniker& computer,
                           const LogPoint& point) {
  const auto wanted = findKey(computer, nameKey);
  if (!wanted) {
    throw FrameworkException("Could not find 'Name' key in Moniker");
  }
  tree.selectNode(NodeLexicon::FirmwareNode);
  while (tree && tree.getNodeDescription() != kind.description) {
    ++tree;
  }
  if (!tree) {
    throw InstrumentationException(kind.noFirmware);
  }
  const std::string firmware = tree.getPathToNode();
  const std::string parent = tree.getPathToParentNode();
  tree.selectNode(parent);
  if (!climbToComputer(tree)) {
    throw InstrumentationException(kind.noComputerAboveFirmware);
  }
  if (nameOfComputer(tree) != *wanted) {
    throw InstrumentationException(kind.otherComputer);
  }
  const std::string parentText = tree.convertPathToString(parent);
  const std::string firmwareText = tree.convertPathToString(firmware);
  std::string instanceId;
  InstanceIdMaker().make(parentText, firmwareText, instanceId);
  traceVariable(point, "InstanceID", instanceId);
  return monikerOf(instanceIdKey, instanceId);
}

Moniker computerOfFirmware(Instrumentation& tree, const FirmwareKind& kind, Moniker& identity,
                           const LogPoint& point) {
  const auto instanceId = findKey(identity, instanceIdKey);
  if (!instanceId) {
    throw FrameworkException("Could not find 'InstanceId' key in Moniker");
  }
  // A path that names no node shows in the sensor type.
  tree.selectNode(tree.convertStringToPath(std::string(parseInstanceId(*instanceId).pathText)));
  if (tree.getSensorType() != NodeLexicon::FirmwareNode) {
    throw InstrumentationException("The specified software is not a firmware");
  }
  if (tree.getNodeDescription() != kind.description) {
    throw InstrumentationException(kind.wrongKind);
  }
  // The parent is reached through the InstanceID's number, not through the tree.
  tree.selectNode(tree.convertStringToPath(parentPathText(*instanceId)));
  if (!climbToComputer(tree)) {
    throw InstrumentationException(kind.noComputerAboveParent);
  }
  const std::string valueField = nameOfComputer(tree);
  traceVariable(point, "valueField", valueField);
  return monikerOf(nameKey, valueField);
}

}  // namespace Oru::SoftwareInventoryProfileProvider
