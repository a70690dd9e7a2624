#include <agent/discovery/Discovery.h>
#include <agent/discovery/Merge.h>
#include <agent/discovery/SourceRunner.h>
#include <agent/discovery/dmi/DmiSource.h>
#include <agent/discovery/drivers/DriverSource.h>
#include <agent/discovery/engine/EngineSource.h>
#include <agent/discovery/esrt/EsrtSource.h>
#include <agent/discovery/gpu/GpuSource.h>
#include <agent/discovery/host/HostSource.h>
#include <agent/discovery/ipmi/IpmiSource.h>
#include <agent/discovery/network/NetworkSource.h>
#include <agent/discovery/processor/ProcessorSource.h>
#include <agent/discovery/storage/StorageSource.h>
#include <agent/discovery/tpm/TpmSource.h>
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
  discovery::NetlinkOpener netlink = options.netlink;
  if (!netlink && root.isLive()) {
    netlink = discovery::kernelNetlink();
  }
  discovery::IpmiOpener ipmi = options.ipmi;
  if (!ipmi && root.isLive()) {
    ipmi = discovery::kernelIpmi();
  }
  return {
      {"host", discovery::readHost},
      {"dmi", discovery::readDmi},
      {"ipmi", [ipmi](SourceContext& context) { discovery::readIpmi(context, ipmi); }},
      {"esrt", discovery::readEsrt},
      {"processor", discovery::readProcessor},
      {"tpm", discovery::readTpm},
      {"engine", discovery::readEngine},
      {"network",
       [ethtool, netlink](SourceContext& context) { discovery::readNetwork(context, ethtool, netlink); }},
      {"storage", discovery::readStorage},
      {"gpu", discovery::readGpu},
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
  std::vector<SourceResult> results =
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
