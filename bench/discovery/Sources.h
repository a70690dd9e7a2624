// The sources of the discovery, to be run one by one.
#pragma once

#include <agent/discovery/Discovery.h>
#include <agent/discovery/Source.h>

#include <vector>

namespace bench {

/// What `agent::discover` runs side by side with the same options, in the same order.
std::vector<agent::discovery::Source> sourcesOf(const agent::DiscoveryOptions& options);

}  // namespace bench
