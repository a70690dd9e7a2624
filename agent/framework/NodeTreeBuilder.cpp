#include <agent/framework/NodeTree.h>

#include <algorithm>
#include <limits>
#include <unordered_set>
#include <utility>

namespace agent {
namespace {

void checkType(int type) {
  if (type < 0) {
    throw std::invalid_argument("a node's type must not be negative");
  }
}

/// A node in an error: its place in the order of adding or in the tree, and what it is.
std::string named(std::string_view description, std::size_t node) {
  return "node " + std::to_string(node) + " (\"" + cleanText(description) + "\")";
}

[[noreturn]] void refuseNumber(const NodeTree& tree, NodeTree::Index node, NodeNumber number) {
  const std::string text = "node number " + pathText(number);
  if (number == noNumber || number == overflowNumber) {
    throw DuplicateNumber(text + ", given to " + named(tree.description(node), node) +
                          ", is reserved and names no node");
  }
  NodeTree::Index earlier = 0;
  while (tree.number(earlier) != number) {
    ++earlier;
  }
  const bool isBelow = node < tree.subtreeEnd(earlier);
  throw DuplicateNumber(text + " is given to " + named(tree.description(earlier), earlier) + " and to " +
                        named(tree.description(node), node) +
                        (isBelow ? " below it: their parent links would form a cycle" : ""));
}

}  // namespace

NodeTree::TextRange NodeTreeBuilder::keep(std::string_view text) {
  const std::string clean = cleanText(text);
  if (clean.size() > std::numeric_limits<std::uint32_t>::max() - texts_.size()) {
    throw std::length_error("the texts of a node tree take more than 4 GiB");
  }
  const NodeTree::TextRange range{static_cast<std::uint32_t>(texts_.size()),
                                  static_cast<std::uint32_t>(clean.size())};
  texts_ += clean;
  return range;
}

NodeTreeBuilder::Handle NodeTreeBuilder::add(Handle parent, int type, std::string_view position,
                                             std::string_view description) {
  if (parent != noParent && parent >= drafts_.size()) {
    throw std::invalid_argument(named(description, drafts_.size()) + " cannot stand below node " +
                                std::to_string(parent) +
                                ", which is not there yet: parents are added before what is below them, so "
                                "that no node stands below itself");
  }
  if (drafts_.size() >= NodeTree::none) {
    throw std::length_error("a node tree has too many nodes");
  }
  checkType(type);
  Draft draft;
  draft.parent = parent;
  drafts_.push_back(draft);
  const Handle node = drafts_.size() - 1;
  describe(node, type, position, description);
  return node;
}

void NodeTreeBuilder::describe(Handle node, int type, std::string_view position,
                               std::string_view description) {
  checkType(type);
  Draft& draft = drafts_.at(node);
  draft.type = type;
  draft.position = keep(position);
  draft.description = keep(description);
}

void NodeTreeBuilder::setNumber(Handle node, NodeNumber number) {
  drafts_.at(node).number = number;
}

void NodeTreeBuilder::setProperty(Handle node, NodeTree::Property property) {
  if (property.id < 0) {
    throw std::invalid_argument("the id of a property must not be negative");
  }
  if (node >= drafts_.size()) {
    throw std::invalid_argument("a property needs a node that was added before");
  }
  properties_.push_back({node, property});
}

bool NodeTreeBuilder::setText(Handle node, int property, std::string_view text) {
  const NodeTree::TextRange range = keep(text);
  if (range.length != 0) {
    setProperty(node, {property, 1, range});
  }
  return range.length != 0;
}

void NodeTreeBuilder::setValue(Handle node, int property, std::uint32_t number) {
  setProperty(node, {property, 0, {number, 0}});
}

void NodeTreeBuilder::addReport(SourceReport report) {
  report.source = cleanText(report.source);
  report.path = cleanText(report.path);
  report.detail = cleanText(report.detail);
  reports_.push_back(std::move(report));
}

NodeTree NodeTreeBuilder::build() {
  return build(
      [](int type, std::string_view position, std::uint32_t n) { return numberFor(type, position, n); });
}

NodeTree NodeTreeBuilder::build(NumberMaker makeNumber) {
  NodeTreeBuilder gathered = std::exchange(*this, NodeTreeBuilder());
  const std::vector<Handle> order = gathered.preOrder();
  std::vector<Index> indexOf(order.size());
  for (Index node = 0; node < order.size(); ++node) {
    indexOf[order[node]] = node;
  }

  NodeTree tree;
  tree.texts_ = std::move(gathered.texts_);
  tree.reports_ = std::move(gathered.reports_);
  gathered.placeNodes(tree, order, indexOf);
  gathered.placeProperties(tree, indexOf);
  gathered.giveNumbers(tree, order, makeNumber);
  keepPaths(tree);
  tree.texts_.shrink_to_fit();
  tree.indexTypes();
  tree.indexNumbers();
  return tree;
}

std::vector<NodeTreeBuilder::Handle> NodeTreeBuilder::preOrder() const {
  std::vector<Handle> firstChild(drafts_.size(), noParent);
  std::vector<Handle> nextSibling(drafts_.size(), noParent);
  Handle firstRoot = noParent;
  for (Handle node = drafts_.size(); node-- > 0;) {
    const Handle parent = drafts_[node].parent;
    Handle& head = parent == noParent ? firstRoot : firstChild[parent];
    nextSibling[node] = std::exchange(head, node);
  }

  std::vector<Handle> order;
  order.reserve(drafts_.size());
  Handle node = firstRoot;
  while (node != noParent) {
    order.push_back(node);
    if (firstChild[node] != noParent) {
      node = firstChild[node];
      continue;
    }
    while (node != noParent && nextSibling[node] == noParent) {
      node = drafts_[node].parent;
    }
    node = node == noParent ? noParent : nextSibling[node];
  }
  return order;
}

void NodeTreeBuilder::placeNodes(NodeTree& tree, const std::vector<Handle>& order,
                                 const std::vector<Index>& indexOf) const {
  tree.nodes_.resize(order.size());
  for (Index index = 0; index < order.size(); ++index) {
    const Draft& draft = drafts_[order[index]];
    NodeTree::Node& node = tree.nodes_[index];
    node.parent = draft.parent == noParent ? NodeTree::none : indexOf[draft.parent];
    node.subtreeEnd = index + 1;
    node.type = draft.type;
    node.position = draft.position;
    node.description = draft.description;
    if (draft.type == Oru::NodeLexicon::ComputerSystemNode) {
      node.computer = index;
    } else if (node.parent != NodeTree::none) {
      node.computer = tree.nodes_[node.parent].computer;
    }
  }
  for (Index index = static_cast<Index>(order.size()); index-- > 0;) {
    const NodeTree::Node& node = tree.nodes_[index];
    if (node.parent != NodeTree::none) {
      Index& end = tree.nodes_[node.parent].subtreeEnd;
      end = std::max(end, node.subtreeEnd);
    }
  }
}

void NodeTreeBuilder::placeProperties(NodeTree& tree, const std::vector<Index>& indexOf) const {
  std::vector<std::uint32_t> settings(tree.nodes_.size(), 0);
  for (const PropertyDraft& draft : properties_) {
    ++settings[indexOf[draft.node]];
  }
  std::uint32_t begin = 0;
  for (Index index = 0; index < tree.nodes_.size(); ++index) {
    tree.nodes_[index].firstProperty = begin;
    begin += settings[index];
  }

  tree.properties_.resize(properties_.size());
  for (const PropertyDraft& draft : properties_) {
    NodeTree::Node& node = tree.nodes_[indexOf[draft.node]];
    const auto first = tree.properties_.begin() + node.firstProperty;
    const auto end = first + node.propertyCount;
    const auto place = std::lower_bound(first, end, draft.property.id,
                                        [](const NodeTree::Property& left, int id) { return left.id < id; });
    if (place == end || place->id != draft.property.id) {
      std::move_backward(place, end, end + 1);
      ++node.propertyCount;
    }
    *place = draft.property;
  }
}

void NodeTreeBuilder::giveNumbers(NodeTree& tree, const std::vector<Handle>& order,
                                  NumberMaker makeNumber) const {
  std::unordered_set<NodeNumber> taken{noNumber, overflowNumber};
  taken.reserve(order.size() + taken.size());
  std::vector<Index> unnumbered;
  for (Index index = 0; index < order.size(); ++index) {
    const std::optional<NodeNumber>& given = drafts_[order[index]].number;
    if (!given) {
      unnumbered.push_back(index);
      continue;
    }
    if (!taken.insert(*given).second) {
      refuseNumber(tree, index, *given);
    }
    tree.nodes_[index].number = *given;
  }

  // In an order that no scan of a machine decides, so that who yields to whom is the same every time.
  const auto key = [&tree](Index index) { return std::pair(tree.type(index), tree.position(index)); };
  std::stable_sort(unnumbered.begin(), unnumbered.end(),
                   [&key](Index left, Index right) { return key(left) < key(right); });
  std::uint32_t n = 1;
  for (std::size_t i = 0; i < unnumbered.size(); ++i) {
    const Index index = unnumbered[i];
    // The claims that failed for an equal node fail for this one too.
    n = i != 0 && key(unnumbered[i - 1]) == key(index) ? n + 1 : 1;
    while (!taken.insert(makeNumber(tree.type(index), tree.position(index), n)).second) {
      ++n;
    }
    tree.nodes_[index].number = makeNumber(tree.type(index), tree.position(index), n);
  }
}

void NodeTreeBuilder::keepPaths(NodeTree& tree) {
  for (NodeTree::Node& node : tree.nodes_) {
    const std::string path = pathText(node.number);
    path.copy(node.path.data(), node.path.size());
  }
}

}  // namespace agent
