// The node tree as text.
#pragma once

#include <agent/framework/NodeTree.h>
#include <cli/Terminal.h>

#include <string>

namespace cli {

/// A line for each node, with branches, then what could not be read and why. Nothing is cut: the identifier
/// at the end of a line is what one copies.
std::string printTree(const agent::NodeTree& tree, const Terminal& terminal);

}  // namespace cli
