// What the associations make of the nodes of a tree.
#pragma once

#include <agent/framework/NodeTree.h>

#include <string>

namespace cli {

/// Whether nodes of this type are software: firmware, BIOS, drivers.
bool isSoftware(int type);

/// The ends of the associations that a software node has, as each is answered when asked from the node:
///
///   on NAME                     installed on the nearest computer above it, if that has a name
///   is its BIOS                 firmware described "BIOS"
///   runs its service processor  firmware described "BMC Firmware"
///   serves port DEVICE          directly below a network device: the first port below that, if it has a name
///   and
///                               a computer with one
///
/// Joined by commas; empty for a node that none of them reaches.
std::string associationMark(const agent::NodeTree& tree, agent::NodeTree::Index node);

}  // namespace cli
