// Invented machines of any size, for measurements.
#pragma once

#include <agent/framework/NodeTree.h>

#include <cstddef>

namespace bench {

/// The name of every sample machine's computer.
inline constexpr const char* sampleComputerName = "sample";

/// A machine with that many software elements: network devices with one firmware each, other firmware below
/// the computer, drivers. Texts and properties are as a real machine's; the same for the same size, always.
agent::NodeTree sampleMachine(std::size_t softwareElements);

}  // namespace bench
