#include <agent/framework/NodeTree.h>
#include <agent/framework/TreeStore.h>

#include <Oru/Exceptions.h>
#include <Oru/Instrumentation.h>

#include <algorithm>
#include <cstring>
#include <memory>
#include <span>
#include <string_view>
#include <utility>

namespace Oru {
namespace {

using agent::NodeTree;
using Index = NodeTree::Index;

/// What a cursor holds from its first selection on: the tree of that moment, and a walk. What a walk selected
/// is one of the tree's own ascending lists, or the one node of `single`; it goes over the run of it that
/// passes the filter.
struct Cursor {
  explicit Cursor(std::shared_ptr<const NodeTree> shared) : tree(std::move(shared)) {}

  void walk(std::span<const Index> nodes) {
    selected = nodes;
    current = nodes.data();
    end = current + nodes.size();
  }
  void walkOne(Index node) {
    single = node;
    walk(std::span(&single, node == NodeTree::none ? 0 : 1));
  }
  /// Starts over, on those of the selected nodes that are in [from, to).
  void narrow(Index from, Index to) {
    const Index* const last = selected.data() + selected.size();
    current = std::lower_bound(selected.data(), last, from);
    end = std::lower_bound(current, last, to);
  }
  [[nodiscard]] bool isOnNode() const { return current != end; }
  /// On the last steps before the end of the tree's own list there is nothing to have fetched.
  void step() {
    ++current;
    if (end - current > fetchedAhead) {
      tree->prefetch(current[fetchedAhead]);
      tree->prefetchParent(current[fetchedAhead / 2]);
    }
  }
  static constexpr std::ptrdiff_t fetchedAhead = 16;

  std::shared_ptr<const NodeTree> tree;
  std::span<const Index> selected;
  const Index* current = nullptr;
  const Index* end = nullptr;
  Index single = NodeTree::none;
};

Cursor* cursorOf(void* state) {
  return static_cast<Cursor*>(state);
}

/// The cursor if it stands on a node, else null.
const Cursor* onNode(void* state) {
  const Cursor* cursor = cursorOf(state);
  return cursor != nullptr && cursor->isOnNode() ? cursor : nullptr;
}

/// The cursor behind `state`, made with the current tree where there is none yet.
Cursor& selecting(void*& state) {
  if (state == nullptr) {
    state = std::make_unique<Cursor>(agent::TreeStore::instance().current()).release();
  }
  return *cursorOf(state);
}

/// The node that a path names. Paths are compared as they are: only the text that `pathText` writes is one.
Index nodeAt(const NodeTree& tree, const std::string& path) {
  const std::optional<agent::NodeNumber> number = agent::numberFromText(path);
  if (!number || agent::pathText(*number) != path) {
    return NodeTree::none;
  }
  return tree.find(*number);
}

/// Numbers have 60 bits, so that nearly all paths have this many digits.
constexpr std::string_view usualPath = "...............";

/// A text of the usual length or less as a string of its own. `NodeTree::pathRoom` characters are copied as
/// one piece, with the end, in place of a call. One piece also lets the reader of the copy have its bytes
/// before they reach the memory, which processors do for what was stored at once.
[[gnu::always_inline]] inline std::string copyInOnePiece(std::string_view path) {
  static_assert(NodeTree::pathRoom == usualPath.size() + 1);
  std::string copy(usualPath);
  std::memcpy(copy.data(), path.data(), NodeTree::pathRoom);
  if (path.size() < usualPath.size()) {
    copy.resize(path.size());
  }
  return copy;
}

/// The path of a node; empty for none.
[[gnu::always_inline]] inline std::string pathOf(const NodeTree& tree, Index node) {
  if (node == NodeTree::none) {
    return {};
  }
  const std::string_view path = tree.path(node);
  return path.size() <= usualPath.size() ? copyInOnePiece(path) : std::string(path);
}

std::string nothingPasses(NodeLexicon::PathType type, const std::string& path) {
  const std::string text = "\"" + path + "\"";
  switch (type) {
    case NodeLexicon::ExactPath:
      return "No node of the walk is at path " + text;
    case NodeLexicon::ParentPath:
      return "No node of the walk is below path " + text;
    case NodeLexicon::ComputerPath:
      return "No node of the walk is below a computer system at path " + text;
  }
  return "Path filter " + std::to_string(static_cast<unsigned int>(type)) + " is unknown; nothing passes it";
}

void applyFilter(Cursor& cursor, NodeLexicon::PathType type, const std::string& path) {
  const NodeTree& tree = *cursor.tree;
  const Index node = nodeAt(tree, path);
  const bool isComputer = node != NodeTree::none && tree.type(node) == NodeLexicon::ComputerSystemNode;
  if (node != NodeTree::none && type == NodeLexicon::ExactPath) {
    cursor.narrow(node, node + 1);
  } else if ((node != NodeTree::none && type == NodeLexicon::ParentPath) ||
             (isComputer && type == NodeLexicon::ComputerPath)) {
    cursor.narrow(node + 1, tree.subtreeEnd(node));
  } else {
    cursor.narrow(0, 0);
  }
}

}  // namespace

Instrumentation::Instrumentation() : state_(nullptr) {}

Instrumentation::~Instrumentation() {
  const std::unique_ptr<Cursor> owned(cursorOf(state_));
}

void Instrumentation::selectNode(NodeLexicon::NodeType type) {
  Cursor& cursor = selecting(state_);
  cursor.walk(cursor.tree->ofType(type));
}

void Instrumentation::selectNode(const std::string& path) {
  try {
    Cursor& cursor = selecting(state_);
    cursor.walkOne(nodeAt(*cursor.tree, path));
  } catch (const InstrumentationException&) {
    // Without a tree there is no node of that path; the store has logged why there is none.
    return;
  }
}

void Instrumentation::setFilter(NodeLexicon::PathType type, const std::string& path) {
  if (state_ == nullptr) {
    throw InstrumentationException("A filter needs a walk: select nodes first");
  }
  Cursor& cursor = *cursorOf(state_);
  applyFilter(cursor, type, path);
  if (!cursor.isOnNode()) {
    throw InstrumentationException(nothingPasses(type, path).c_str());
  }
}

Instrumentation::operator bool() {
  return onNode(state_) != nullptr;
}

void Instrumentation::operator++() {
  if (onNode(state_) != nullptr) {
    cursorOf(state_)->step();
  }
}

std::string Instrumentation::getPathToNode() {
  const Cursor* cursor = onNode(state_);
  return cursor == nullptr ? std::string() : pathOf(*cursor->tree, *cursor->current);
}

std::string Instrumentation::getPathToParentNode() {
  const Cursor* cursor = onNode(state_);
  return cursor == nullptr ? std::string() : pathOf(*cursor->tree, cursor->tree->parent(*cursor->current));
}

std::string Instrumentation::getPathToComputer() {
  const Cursor* cursor = onNode(state_);
  return cursor == nullptr ? std::string() : pathOf(*cursor->tree, cursor->tree->computer(*cursor->current));
}

// A path is the hexadecimal text itself.
std::string Instrumentation::convertPathToString(const std::string& path) {
  return path.size() == usualPath.size() ? copyInOnePiece(path) : path;
}

std::string Instrumentation::convertStringToPath(const std::string& text) {
  const std::optional<agent::NodeNumber> number = agent::numberFromText(text);
  return number ? agent::pathText(*number) : text;
}

std::string Instrumentation::getNodeDescription() {
  const Cursor* cursor = onNode(state_);
  return cursor == nullptr ? std::string() : std::string(cursor->tree->description(*cursor->current));
}

int Instrumentation::getSensorType() {
  const Cursor* cursor = onNode(state_);
  return cursor == nullptr ? -1 : cursor->tree->type(*cursor->current);
}

bool Instrumentation::getProperty(NodeLexicon::Properties property, std::string& value) {
  const Cursor* cursor = onNode(state_);
  if (cursor == nullptr) {
    return false;
  }
  const std::optional<std::string_view> text = cursor->tree->text(*cursor->current, property);
  if (!text) {
    return false;
  }
  value.assign(*text);
  return true;
}

bool Instrumentation::getProperty(NodeLexicon::Properties property, unsigned int& value) {
  const Cursor* cursor = onNode(state_);
  if (cursor == nullptr) {
    return false;
  }
  const std::optional<std::uint32_t> number = cursor->tree->value(*cursor->current, property);
  if (!number) {
    return false;
  }
  value = *number;
  return true;
}

// The tree shows what the machine is; no element of it takes a value from outside, so every write is refused.
// NOLINTNEXTLINE(performance-unnecessary-value-param): the contract has it by value
bool Instrumentation::setProperty(NodeLexicon::Properties, std::vector<unsigned int>) {
  return false;
}

}  // namespace Oru
