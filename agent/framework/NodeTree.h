// The machine as an immutable tree of typed nodes.
//
// Nodes stand in one array in pre-order, so that everything below a node, at any depth, is a range of
// indices. Texts and properties lie in pools beside it. A tree is built once (`NodeTreeBuilder`), never
// changed, and may be read from any number of threads.
#pragma once

#include <Oru/NodeLexicon.h>

#include <array>
#include <bit>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <span>
#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

namespace agent {

/// The number of a node: its identity over restarts, updates and renamings. Its hexadecimal text is the
/// node's path.
using NodeNumber = std::uint64_t;

/// Types and properties of the framework's own start here; the numbers below are the contract's.
inline constexpr int firstOwnNumber = 1000;

/// Numbers that malformed identifiers read as. They name no node.
inline constexpr NodeNumber noNumber = 0;
inline constexpr NodeNumber overflowNumber = ~NodeNumber{0};

/// The number of the (first) computer system, in every tree.
inline constexpr NodeNumber computerNumber = 1;

/// The position of the (first) computer system.
inline constexpr std::string_view computerPosition = "computer";

/// What a source could not read. Carried with the tree, so that nothing that is missing is missing silently.
struct SourceReport {
  enum class Reason {
    Absent,        ///< the machine has no such thing
    NoPermission,  ///< it is there, and this process may not read it
    Unreadable,    ///< it is there, and reading or parsing failed
    TimedOut,      ///< reading did not end in the time a source has
  };
  std::string source;  ///< which source: "dmi", "network", "drivers"
  std::string path;    ///< what was read: a file, a folder, an ioctl with its device
  Reason reason = Reason::Absent;
  std::string detail;  ///< the rest in words, such as the system's error text; may be empty

  friend bool operator==(const SourceReport&, const SourceReport&) = default;
};

/// One property of a node: a number or a text.
struct PropertyView {
  int id = 0;
  bool isText = false;
  std::uint32_t number = 0;
  std::string_view text;

  friend bool operator==(const PropertyView&, const PropertyView&) = default;
};

class NodeTree {
 public:
  using Index = std::uint32_t;
  static constexpr Index none = 0xffffffff;

  NodeTree() = default;  ///< the empty tree

  [[nodiscard]] std::size_t size() const { return nodes_.size(); }

  // Each takes the index of a node, below size().
  [[nodiscard]] int type(Index node) const { return nodes_[node].type; }
  [[nodiscard]] NodeNumber number(Index node) const { return nodes_[node].number; }
  /// The parent, or `none`.
  [[nodiscard]] Index parent(Index node) const { return nodes_[node].parent; }
  /// One past the last node below `node`: what is below it is the range [node + 1, subtreeEnd(node)).
  [[nodiscard]] Index subtreeEnd(Index node) const { return nodes_[node].subtreeEnd; }
  /// Has the processor fetch what a walk will soon read: a node, or the parent of one that was fetched.
  void prefetch(Index node) const { __builtin_prefetch(&nodes_[node]); }
  void prefetchParent(Index node) const {
    if (nodes_[node].parent != none) {
      __builtin_prefetch(&nodes_[nodes_[node].parent]);
    }
  }
  /// The nearest computer system at or above `node`, or `none`.
  [[nodiscard]] Index computer(Index node) const { return nodes_[node].computer; }
  /// The number's path text, as `pathText` writes it. Kept ready, because every published name holds two of
  /// them; `pathRoom` characters can be read there, NULs behind the text where it is shorter.
  [[nodiscard]] std::string_view path(Index node) const {
    return {nodes_[node].path.data(), pathLength(nodes_[node].number)};
  }
  static constexpr std::size_t pathRoom = 16;
  [[nodiscard]] std::string_view description(Index node) const { return view(nodes_[node].description); }
  /// What the number was made of, with the type: the node's place on its bus. May be empty (numbers given
  /// outright).
  [[nodiscard]] std::string_view position(Index node) const { return view(nodes_[node].position); }

  /// A text property; nothing where the node has none of that id, or has it as a number.
  [[nodiscard]] std::optional<std::string_view> text(Index node, int property) const;
  /// A number property; nothing where the node has none of that id, or has it as a text.
  [[nodiscard]] std::optional<std::uint32_t> value(Index node, int property) const;
  /// All properties of a node, by rising id.
  [[nodiscard]] std::vector<PropertyView> properties(Index node) const;

  /// All nodes of a type, in pre-order; empty where there are none.
  [[nodiscard]] std::span<const Index> ofType(int type) const;
  /// The node with that number, or `none`.
  [[nodiscard]] Index find(NodeNumber number) const;

  /// What could not be read when the tree was made.
  [[nodiscard]] const std::vector<SourceReport>& reports() const { return reports_; }

  /// Same nodes in the same order with the same numbers, texts and properties, and the same reports.
  friend bool operator==(const NodeTree& left, const NodeTree& right);

 private:
  friend class NodeTreeBuilder;

  struct TextRange {
    std::uint32_t begin = 0;
    std::uint32_t length = 0;
  };
  /// One line of the processor's caches, with all that a name takes of a node.
  struct alignas(64) Node {
    NodeNumber number = noNumber;
    std::array<char, pathRoom> path{};
    Index parent = none;
    Index subtreeEnd = 0;
    Index computer = none;
    std::int32_t type = 0;
    TextRange description;
    TextRange position;
    std::uint32_t firstProperty = 0;
    std::uint32_t propertyCount = 0;
  };
  struct Property {
    std::int32_t id = 0;
    std::uint32_t isText = 0;
    TextRange textOrNumber;  ///< a number stands in `begin`
  };
  struct TypeRange {
    std::int32_t type = 0;
    std::uint32_t begin = 0;
    std::uint32_t end = 0;
  };

  /// How many hexadecimal digits a number has.
  static constexpr std::size_t pathLength(NodeNumber number) {
    return (67U - static_cast<unsigned int>(std::countl_zero(number | 1U))) / 4;
  }
  [[nodiscard]] std::string_view view(TextRange range) const {
    return {texts_.data() + range.begin, range.length};
  }
  [[nodiscard]] const Property* findProperty(Index node, int property) const;
  void indexTypes();
  void indexNumbers();

  std::vector<Node> nodes_;
  std::vector<Property> properties_;
  std::string texts_;
  std::vector<TypeRange> typeRanges_;  ///< by rising type; ranges of byType_
  std::vector<Index> byType_;
  /// Nodes by rising mixed number, in buckets by its upper bits: a look-up takes one step on most numbers and
  /// is a binary search in one bucket on the worst.
  std::vector<Index> byNumber_;
  std::vector<std::uint32_t> bucketBegins_;  ///< of each bucket in byNumber_, and the end of the last
  int bucketShift_ = 63;
  std::vector<SourceReport> reports_;
};

// Short, and called for every published property: in sight of their callers.

inline const NodeTree::Property* NodeTree::findProperty(Index node, int property) const {
  const Property* at = properties_.data() + nodes_[node].firstProperty;
  const Property* const end = at + nodes_[node].propertyCount;
  // A node has a handful of properties: looking at each is faster than halving.
  while (at != end && at->id < property) {
    ++at;
  }
  return at != end && at->id == property ? at : nullptr;
}

inline std::optional<std::string_view> NodeTree::text(Index node, int property) const {
  const Property* found = findProperty(node, property);
  if (found == nullptr || found->isText == 0) {
    return std::nullopt;
  }
  return view(found->textOrNumber);
}

inline std::optional<std::uint32_t> NodeTree::value(Index node, int property) const {
  const Property* found = findProperty(node, property);
  if (found == nullptr || found->isText != 0) {
    return std::nullopt;
  }
  return found->textOrNumber.begin;
}

/// Two nodes of a tree were given the same number, or one the number 0 or 2^64-1. A node with the number of
/// one above it would stand below itself: who climbs by paths would never come to a root.
class DuplicateNumber : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

/// Gathers nodes in any order of parents before children, then makes a tree of them.
///
/// The order of siblings is the order in which they were added. A node's number is made of its type and its
/// position; the number of one tree's node therefore does not depend on any other node, except where two
/// would get the same number: then the one whose (type, position) sorts first keeps it and the others get the
/// number of (type, position, n) for n = 2, 3, ...; nodes of the same type and position are told apart by
/// their order in the tree. Numbers are made with 60 bits, so that their text stays short, and are never 0.
class NodeTreeBuilder {
 public:
  using Handle = std::size_t;
  static constexpr Handle noParent = ~Handle{0};
  /// Makes the number of the n-th (from 1) claim of a type and position.
  using NumberMaker = NodeNumber (*)(int type, std::string_view position, std::uint32_t n);

  /// Adds a node below `parent` (an earlier handle, or `noParent`). `description` and `position` are taken
  /// through `cleanText`. Throws `std::invalid_argument` for another parent, which is what keeps parent links
  /// from forming a cycle, and for a negative type.
  Handle add(Handle parent, int type, std::string_view position, std::string_view description);
  /// Replaces what `add` was given: for readers that meet a node's children before its own texts.
  void describe(Handle node, int type, std::string_view position, std::string_view description);
  /// Gives a node its number outright.
  void setNumber(Handle node, NodeNumber number);
  /// Sets a text property; a text that is empty after `cleanText` sets nothing (absent is absent) and gives
  /// false. Of several settings of one property the last stands. Throws `std::invalid_argument` for a
  /// negative property.
  bool setText(Handle node, int property, std::string_view text);
  /// Sets a number property; as above.
  void setValue(Handle node, int property, std::uint32_t number);
  /// Adds a report; its texts are taken through `cleanText`.
  void addReport(SourceReport report);

  /// Throws `DuplicateNumber` where numbers that were given outright clash. The builder is empty afterwards.
  NodeTree build();
  /// The same with other numbers: for tests, because collisions of the true ones cannot be had.
  NodeTree build(NumberMaker makeNumber);

 private:
  using Index = NodeTree::Index;
  struct Draft {
    Handle parent = noParent;
    int type = 0;
    NodeTree::TextRange position;
    NodeTree::TextRange description;
    std::optional<NodeNumber> number;
  };
  struct PropertyDraft {
    Handle node = noParent;
    NodeTree::Property property;
  };

  NodeTree::TextRange keep(std::string_view text);
  void setProperty(Handle node, NodeTree::Property property);
  [[nodiscard]] std::vector<Handle> preOrder() const;
  void placeNodes(NodeTree& tree, const std::vector<Handle>& order, const std::vector<Index>& indexOf) const;
  void placeProperties(NodeTree& tree, const std::vector<Index>& indexOf) const;
  void giveNumbers(NodeTree& tree, const std::vector<Handle>& order, NumberMaker makeNumber) const;
  static void keepPaths(NodeTree& tree);

  std::vector<Draft> drafts_;
  std::vector<PropertyDraft> properties_;
  std::string texts_;
  std::vector<SourceReport> reports_;
};

/// The number that a type and a position make: the same on every machine, for ever. `n` above 1 is for the
/// n-th claim of one type and position (see `NodeTreeBuilder`).
///
/// 1 for the computer system at `computerPosition`. Else FNV-1a (64 bits) over the type as four bytes, least
/// significant first, and the bytes of the position, and where `n` is above 1 also a zero byte and `n` as
/// four bytes, least significant first; then the 64-bit finaliser `mix64`; then the upper four bits are
/// folded onto the lower ones. 0 and 1 are taken for this and read as 2 and 3.
NodeNumber numberFor(int type, std::string_view position, std::uint32_t n = 1);

/// `text` without blanks and control characters at both ends, made valid UTF-8 that any XML can hold (each
/// byte that is not becomes U+FFFD, and so do U+FFFE and U+FFFF), with a blank in place of each control
/// character inside.
std::string cleanText(std::string_view text);

/// The path text of a number: lower-case hexadecimal without leading zeros.
std::string pathText(NodeNumber number);

/// The number that a text of hexadecimal digits of either case stands for, leading zeros allowed; nothing
/// where the text is empty, holds anything else, or needs more than 64 bits.
std::optional<NodeNumber> numberFromText(std::string_view text);

}  // namespace agent
