// Where what all sources found comes together.
#pragma once

#include <agent/discovery/Source.h>

#include <vector>

namespace agent::discovery {

/// What stands directly below the computer: the nodes of all results, in order.
///
/// A node at the place (type and position) of an earlier one is the same: the earlier takes what it lacks of
/// its properties, and its children in the same way.
///
/// Declared firmware repeats a firmware node, which then takes what it lacks of the declared properties,
/// where both have the same version (the same text, but for leading zeros of numbers; or one of the node's
/// `otherVersions`, and then the declared text is the machine's own and replaces the node's) and one thing
/// more speaks for it:
///
/// - the declared kind is the node's description;
/// - the node belongs to the device that was declared;
/// - both have the same release date;
/// - the declared name says no more than the node's description does ("System BIOS" of a "BIOS").
///
/// The same id is enough without the version, and so is the same kind where the node has no version. Names do
/// no more than that: whatever a machine calls its firmware, it changes no element's description.
///
/// A node takes one declaration at most of each list: what is on a list twice is there twice. What repeats
/// nothing stands below its device, else behind the nodes of its source, and can be repeated by what is
/// declared later; it bears the description of its kind where there is no other such element, else the one
/// that its source gave it.
std::vector<FoundNode> mergeResults(std::vector<SourceResult>& results);

}  // namespace agent::discovery
