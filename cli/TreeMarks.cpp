#include <cli/TreeMarks.h>

#include <algorithm>
#include <optional>
#include <string_view>

namespace cli {
namespace {

using agent::NodeTree;
namespace lexicon = Oru::NodeLexicon;

std::optional<std::string_view> computerOf(const NodeTree& tree, NodeTree::Index node) {
  const NodeTree::Index computer = tree.computer(node);
  return computer == NodeTree::none ? std::nullopt : tree.text(computer, lexicon::NameProperty);
}

/// From firmware that lies deeper the association finds no device: it looks at the parent alone. A port
/// without a computer that has a name is not published.
std::optional<std::string_view> servedPort(const NodeTree& tree, NodeTree::Index node) {
  const NodeTree::Index device = tree.parent(node);
  if (device == NodeTree::none || tree.type(device) != lexicon::NetworkDeviceNode) {
    return std::nullopt;
  }
  const auto ports = tree.ofType(lexicon::NetworkPortNode);
  const auto first = std::upper_bound(ports.begin(), ports.end(), device);
  if (first == ports.end() || *first >= tree.subtreeEnd(device) || !computerOf(tree, *first)) {
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
  if (const auto computer = computerOf(tree, node)) {
    const bool isFirmware = tree.type(node) == lexicon::FirmwareNode;
    mark.append("on ").append(*computer);
    mark.append(isFirmware && tree.description(node) == "BIOS" ? ", is its BIOS" : "");
    mark.append(isFirmware && tree.description(node) == "BMC Firmware" ? ", runs its service processor" : "");
  }
  if (const auto port = servedPort(tree, node)) {
    mark.append(mark.empty() ? "" : ", ").append("serves port ").append(*port);
  }
  return mark;
}

}  // namespace cli
