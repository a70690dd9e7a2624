#include <cli/TreeMarks.h>

#include <algorithm>
#include <optional>
#include <string_view>

namespace cli {
namespace {

using agent::NodeTree;
namespace lexicon = Oru::NodeLexicon;

/// From firmware that lies deeper the association finds no device: it looks at the parent alone.
std::optional<std::string_view> servedPort(const NodeTree& tree, NodeTree::Index node) {
  const NodeTree::Index device = tree.parent(node);
  if (device == NodeTree::none || tree.type(device) != lexicon::NetworkDeviceNode) {
    return std::nullopt;
  }
  const auto ports = tree.ofType(lexicon::NetworkPortNode);
  const auto first = std::upper_bound(ports.begin(), ports.end(), device);
  if (first == ports.end() || *first >= tree.subtreeEnd(device)) {
    return std::nullopt;
  }
  return tree.text(*first, lexicon::NameProperty);
}

}  // namespace

bool isSoftware(int type) {
  return type == lexicon::BiosNode || type == lexicon::FirmwareNode || type == lexicon::DriverNode;
}

std::string associationMark(const NodeTree& tree, NodeTree::Index node) {
  std::string mark;
  const NodeTree::Index computer = tree.computer(node);
  if (computer != NodeTree::none) {
    if (const auto name = tree.text(computer, lexicon::NameProperty)) {
      const bool isFirmware = tree.type(node) == lexicon::FirmwareNode;
      mark.append("on ").append(*name);
      mark.append(isFirmware && tree.description(node) == "BIOS" ? ", is its BIOS" : "");
      mark.append(isFirmware && tree.description(node) == "BMC Firmware" ? ", runs its service processor"
                                                                         : "");
    }
  }
  if (const auto port = servedPort(tree, node)) {
    mark.append(mark.empty() ? "" : ", ").append("serves port ").append(*port);
  }
  return mark;
}

}  // namespace cli
