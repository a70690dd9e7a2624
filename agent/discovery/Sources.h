// Which sources there are.
#pragma once

#include <agent/discovery/Discovery.h>
#include <agent/discovery/Source.h>
#include <agent/discovery/SystemRoot.h>

#include <vector>

namespace agent::discovery {

/// In the order in which what they find stands below the computer. Whatever asks the running kernel is what
/// the options have, else, for the live root, the kernel's own.
std::vector<Source> makeSources(const DiscoveryOptions& options, const SystemRoot& root);

}  // namespace agent::discovery
