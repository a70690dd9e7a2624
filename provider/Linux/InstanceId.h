// The InstanceID of a software element: the number of its parent in decimal, "@", its own path text.
//
// Example: parent text 1a and node text xyz give 26@xyz. A parent's number alone, without "@", stands for all
// software below that parent.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>

#include "Linux/Digits.h"

namespace Oru::SoftwareInventoryProfileProvider {

/// Makes InstanceIDs of nodes one after the other. The number of a parent is written once for children in a
/// row.
class InstanceIdMaker {
 public:
  /// Fills `instanceId`, in the room that it has, from the path texts of a node's parent and of itself. A
  /// parent text that does not begin with a hexadecimal number counts as 0.
  void make(const std::string& parentText, const std::string& nodeText, std::string& instanceId);

 private:
  std::uint64_t parent_ = 0;
  DecimalText prefix_{parent_, '@'};  ///< what an InstanceID below parent_ begins with
};

/// What an InstanceID says, as stream extraction reads it: a decimal number, one character, a word.
struct InstanceIdParts {
  std::uint64_t parent = 0;
  std::string_view pathText;  ///< points into the text that was parsed; empty where it does not go so far
};
InstanceIdParts parseInstanceId(std::string_view instanceId);

/// The number of the node with this path text, in decimal: what an InstanceID of its children begins with.
std::string nodeNumber(const std::string& pathText);

/// The path text of the parent that an identifier begins with: its decimal number in lower-case hexadecimal.
/// What does not begin with a number counts as 0.
std::string parentPathText(std::string_view identifier);

}  // namespace Oru::SoftwareInventoryProfileProvider
