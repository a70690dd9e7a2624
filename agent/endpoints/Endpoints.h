// The elements that associations of the software inventory end on, as the node tree has them: computers,
// management controllers and network ports.
//
// Nothing here knows CMPI: elements have keys and properties by their CIM names, and values.
#pragma once

#include <Oru/Instrumentation.h>

#include <cstddef>
#include <cstdint>
#include <functional>
#include <optional>
#include <span>
#include <string>
#include <unordered_set>
#include <variant>
#include <vector>

namespace agent::endpoints {

using Value = std::variant<std::string, std::uint16_t, std::uint64_t, std::vector<std::uint16_t>>;

struct Property {
  const char* name;
  Value value;
};

struct Key {
  const char* name;
  std::string value;
};
using Keys = std::vector<Key>;

/// The names of computers, for nodes below them. Remembers the last, because a walk meets the nodes of one
/// computer together.
class ComputerNames {
 public:
  /// The name of the computer that `node` stands on belongs to; nothing where there is none, or it has no
  /// name.
  std::optional<std::string> of(Oru::Instrumentation& node);

 private:
  Oru::Instrumentation computer_;
  std::string path_;
  std::optional<std::string> name_;
};

/// A class of elements: which nodes they are, and what these tell.
struct Kind {
  unsigned short classId;  ///< the framework's number of the class
  const char* className;
  std::span<const char* const> keyNames;  ///< in the order of `Keys`
  Oru::NodeLexicon::NodeType nodes;
  /// Whether the node is one; null: each of its type is.
  bool (*isOne)(Oru::Instrumentation& node);
  /// The keys, in the order of `keyNames`; nothing where one cannot be had.
  std::optional<Keys> (*keysOf)(Oru::Instrumentation& node, ComputerNames& computers);
  /// What the node tells beyond the keys; what it does not tell is left out.
  std::vector<Property> (*propertiesOf)(Oru::Instrumentation& node);
};

/// The kind of that class, or null.
const Kind* kindOf(unsigned short classId);
/// "KELVO_ComputerSystem, ...": all of them, for messages.
std::string classNames();

/// A cursor over the elements of a kind, in the order of the tree's walk. What it costs grows with the number
/// of nodes of the kind's type, however few of them pass. For one thread.
class Endpoints {
 public:
  using Passes = std::function<bool(const Keys&)>;

  /// Stands on the first element whose keys pass. Throws `Oru::InstrumentationException` where there is no
  /// tree.
  Endpoints(const Kind& kind, Passes passes);

  explicit operator bool() { return static_cast<bool>(node_); }
  void operator++();  ///< to the next element whose keys pass

  // Of the element that the cursor stands on.
  [[nodiscard]] const Keys& keys() const { return keys_; }
  std::vector<Property> properties() { return kind_->propertiesOf(node_); }

  /// Nodes up to here that cannot be published, because they lack what makes a key.
  [[nodiscard]] std::size_t withoutKeys() const { return withoutKeys_; }
  /// Nodes up to here that passed, but had the keys of one before: there is one element of a name.
  [[nodiscard]] std::size_t repeated() const { return repeated_; }

 private:
  void findNext();
  bool takeKeys();

  const Kind* kind_;
  Passes passes_;
  Oru::Instrumentation node_;
  ComputerNames computers_;
  Keys keys_;
  std::unordered_set<std::string> seen_;
  std::size_t withoutKeys_ = 0;
  std::size_t repeated_ = 0;
};

}  // namespace agent::endpoints
