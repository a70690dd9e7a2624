// A cursor over the machine's tree of typed nodes.
//
// Threads: one cursor belongs to one thread at a time; independent cursors may be used from different
// threads. Ownership: a cursor owns its state and nothing else; the strings that it returns are the caller's.
// The state is opaque, so that any framework library that keeps this contract can stand behind it.
#pragma once

#include <Oru/NodeLexicon.h>

#include <string>
#include <vector>

#pragma GCC visibility push(default)
namespace Oru {

/// A node has a type, a sensor type (an integer in the numbering of the types), a description, numbered
/// properties, a path (an opaque string that names it) and a parent. A path converts to a text of hexadecimal
/// digits and back; the text reads as an unsigned 64-bit number, and that number, written in lower-case
/// hexadecimal without a prefix, converts back to a path of the same node.
class Instrumentation {
 public:
  /// A fresh cursor stands on no node.
  Instrumentation();
  ~Instrumentation();
  Instrumentation(const Instrumentation&) = delete;
  Instrumentation& operator=(const Instrumentation&) = delete;

  /// Starts a walk over all nodes of `type` and stands on the first. Where the type has no nodes, a framework
  /// either throws `Oru::InstrumentationException` or leaves the cursor on no node.
  void selectNode(NodeLexicon::NodeType type);

  /// Stands on the node with that path; on no node when there is none. It is a walk of that one node.
  void selectNode(const std::string& path);

  /// Narrows what was selected to what `type` and `path` name, and stands on the first node that passes: a
  /// walk is what was selected under one filter, the last that was set. It starts over however far the cursor
  /// had come, from past the end too. Where nothing passes, a framework throws
  /// `Oru::InstrumentationException`.
  void setFilter(NodeLexicon::PathType type, const std::string& path);

  /// True while the cursor stands on a node.
  explicit operator bool();

  /// Moves to the next node of the walk, by its type and filter; to no node after the last.
  void operator++();

  /// Path of the current node.
  std::string getPathToNode();
  /// Path of the current node's parent.
  std::string getPathToParentNode();
  /// Path of the computer system that the current node belongs to.
  std::string getPathToComputer();

  /// The hexadecimal text of a path.
  std::string convertPathToString(const std::string& path);
  /// The path that a hexadecimal text stands for; it need not name a node.
  std::string convertStringToPath(const std::string& text);

  /// The current node's description.
  std::string getNodeDescription();

  /// The current node's sensor type.
  int getSensorType();

  /// Reads a text property of the current node. Returns false, and may leave `value` with anything, where the
  /// node does not have it.
  bool getProperty(NodeLexicon::Properties property, std::string& value);
  /// Reads a number property of the current node; as above.
  bool getProperty(NodeLexicon::Properties property, unsigned int& value);

  /// Writes a property of the current node. True on success.
  bool setProperty(NodeLexicon::Properties property, std::vector<unsigned int> values);

 private:
  void* state_;
};

}  // namespace Oru
#pragma GCC visibility pop
