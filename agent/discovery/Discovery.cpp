#include <agent/discovery/Discovery.h>
#include <agent/discovery/SourceRunner.h>
#include <agent/discovery/dmi/DmiSource.h>
#include <agent/discovery/drivers/DriverSource.h>
#include <agent/discovery/host/HostSource.h>
#include <agent/discovery/network/NetworkSource.h>
#include <agent/framework/OwnNumbers.h>

#include <Oru/NodeLexicon.h>

#include <utility>

namespace agent {

namespace {

using discovery::FoundNode;
using discovery::Source;
using discovery::SourceContext;
using discovery::SourceResult;
using discovery::SystemRoot;

/// In the order in which what they find stands below the computer.
std::vector<Source> makeSources(const DiscoveryOptions& options, const SystemRoot& root) {
  std::shared_ptr<discovery::Ethtool> ethtool = options.ethtool;
  if (ethtool == nullptr && root.isLive()) {
    ethtool = discovery::makeKernelEthtool();
  }
  return {
      {"host", discovery::readHost},
      {"dmi", discovery::readDmi},
      {"network", [ethtool](SourceContext& context) { discovery::readNetwork(context, ethtool); }},
      {"drivers",
       [modules = options.modules](SourceContext& context) { discovery::readDrivers(context, modules); }},
  };
}

void addNode(NodeTreeBuilder& builder, NodeTreeBuilder::Handle parent, const FoundNode& found) {
  const NodeTreeBuilder::Handle node = builder.add(parent, found.type, found.position, found.description);
  for (const auto& [property, text] : found.texts) {
    builder.setText(node, property, text);
  }
  for (const auto& [property, number] : found.numbers) {
    builder.setValue(node, property, number);
  }
  for (const FoundNode& child : found.children) {
    addNode(builder, node, child);
  }
}

}  // namespace

NodeTree discover(const DiscoveryOptions& options) {
  const SystemRoot root(options.root);
  const std::vector<SourceResult> results =
      discovery::runSources(makeSources(options, root), root, options.deadline);

  NodeTreeBuilder builder;
  const NodeTreeBuilder::Handle computer = builder.add(
      NodeTreeBuilder::noParent, Oru::NodeLexicon::ComputerSystemNode, computerPosition, "Computer System");
  builder.setNumber(computer, computerNumber);
  if (root.isLive()) {  // the computer that this runs on; of another root nobody knows
    builder.setText(computer, StateProperty, "up");
  }
  for (const SourceResult& result : results) {
    if (result.computerName) {
      builder.setText(computer, Oru::NodeLexicon::NameProperty, *result.computerName);
    }
    for (const FoundNode& node : result.nodes) {
      addNode(builder, computer, node);
    }
    for (const SourceReport& report : result.reports) {
      builder.addReport(report);
    }
  }
  return builder.build();
}

}  // namespace agent
