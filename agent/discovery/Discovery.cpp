#include <agent/discovery/Discovery.h>
#include <agent/discovery/Merge.h>
#include <agent/discovery/SourceRunner.h>
#include <agent/discovery/Sources.h>
#include <agent/framework/OwnNumbers.h>

#include <Oru/NodeLexicon.h>

#include <utility>

namespace agent {

namespace {

using discovery::FoundNode;
using discovery::SourceResult;
using discovery::SystemRoot;

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
  std::vector<SourceResult> results =
      discovery::runSources(discovery::makeSources(options, root), root, options.deadline);

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
    for (const SourceReport& report : result.reports) {
      builder.addReport(report);
    }
  }
  for (const FoundNode& node : discovery::mergeResults(results)) {
    addNode(builder, computer, node);
  }
  return builder.build();
}

}  // namespace agent
