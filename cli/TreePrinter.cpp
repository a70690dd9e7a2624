#include <agent/framework/Names.h>
#include <agent/framework/OwnNumbers.h>
#include <cli/Text.h>
#include <cli/TreeMarks.h>
#include <cli/TreePrinter.h>

#include <optional>
#include <string_view>
#include <vector>

namespace cli {
namespace {

using agent::NodeTree;
namespace lexicon = Oru::NodeLexicon;

struct Branches {
  std::string_view child;
  std::string_view lastChild;
  std::string_view beside;  ///< before the lines below a child that has siblings after it
  std::string_view below;   ///< before the lines below a last child
};

constexpr Branches utf8Branches{"├─ ", "└─ ", "│  ", "   "};
constexpr Branches asciiBranches{"|- ", "`- ", "|  ", "   "};

/// The InstanceID of a software element; of any other node the number that the InstanceIDs of the software
/// below it start with.
std::string identifier(const NodeTree& tree, NodeTree::Index node) {
  if (!isSoftware(tree.type(node))) {
    return std::to_string(tree.number(node));
  }
  const NodeTree::Index parent = tree.parent(node);
  const agent::NodeNumber parentNumber = parent == NodeTree::none ? agent::noNumber : tree.number(parent);
  return std::to_string(parentNumber) + "@" + agent::pathText(tree.number(node));
}

std::optional<std::string_view> version(const NodeTree& tree, NodeTree::Index node) {
  for (const int property :
       {lexicon::VersionStringProperty, lexicon::FirmwareRevisionProperty, lexicon::DriverVersionProperty}) {
    if (const auto text = tree.text(node, property)) {
      return text;
    }
  }
  return std::nullopt;
}

std::string nodeText(const NodeTree& tree, NodeTree::Index node) {
  const auto typeName = agent::nodeTypeName(tree.type(node));
  std::string text = typeName ? std::string(*typeName) : "type " + std::to_string(tree.type(node));
  const std::string_view description = tree.description(node);
  if (!description.empty()) {
    text.append(" ").append(description);
  }
  const auto name = tree.text(node, lexicon::NameProperty);
  if (name && description.find(*name) == std::string_view::npos) {
    text.append(" (").append(*name).append(")");
  }
  if (const auto versionText = version(tree, node)) {
    text.append(", version ").append(*versionText);
  }
  if (const auto devices = tree.text(node, agent::DrivenDevicesProperty)) {
    text.append(", drives ").append(*devices);
  }
  if (isSoftware(tree.type(node))) {
    const std::string mark = associationMark(tree, node);
    text.append(mark.empty() ? "" : "; ").append(mark);
  }
  return text.append("  [").append(identifier(tree, node)).append("]");
}

std::string_view reasonText(agent::SourceReport::Reason reason) {
  switch (reason) {
    case agent::SourceReport::Reason::Absent:
      return "absent";
    case agent::SourceReport::Reason::NoPermission:
      return "no permission";
    case agent::SourceReport::Reason::Unreadable:
      return "unreadable";
    case agent::SourceReport::Reason::TimedOut:
      return "timed out";
  }
  return "unreadable";
}

std::string reportText(const agent::SourceReport& report) {
  std::string text = report.source;
  if (!report.path.empty()) {
    text.append(": ").append(report.path);
  }
  text.append(": ").append(reasonText(report.reason));
  if (!report.detail.empty()) {
    text.append(" (").append(report.detail).append(")");
  }
  return text;
}

}  // namespace

std::string printTree(const NodeTree& tree, const Terminal& terminal) {
  const Branches& branches = terminal.drawing == Charset::Utf8 ? utf8Branches : asciiBranches;
  struct Open {
    NodeTree::Index node;
    std::string prefix;  ///< of the lines of its children
  };
  std::vector<Open> open;  // the ancestors of the node at hand
  std::string out;
  for (NodeTree::Index node = 0; node < tree.size(); ++node) {
    while (!open.empty() && tree.subtreeEnd(open.back().node) <= node) {
      open.pop_back();
    }
    std::string below;
    if (!open.empty()) {
      const Open& parent = open.back();
      const bool last = tree.subtreeEnd(node) == tree.subtreeEnd(parent.node);
      out.append(parent.prefix).append(last ? branches.lastChild : branches.child);
      below = parent.prefix;
      below.append(last ? branches.below : branches.beside);
    }
    out.append(printable(nodeText(tree, node), terminal.values)).append("\n");
    open.push_back({node, std::move(below)});
  }
  if (!tree.reports().empty()) {
    out.append(out.empty() ? "" : "\n").append("Could not be read:\n");
  }
  for (const agent::SourceReport& report : tree.reports()) {
    out.append("  ").append(printable(reportText(report), terminal.values)).append("\n");
  }
  return out;
}

}  // namespace cli
