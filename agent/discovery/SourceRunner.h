// Runs sources side by side, each with a bound in time.
#pragma once

#include <agent/discovery/Source.h>

#include <chrono>
#include <vector>

namespace agent::discovery {

/// Reads all sources; the results stand in their order. Returns after `deadline` at the latest: a source that
/// has not ended by then is reported as timed out, with what it published before, and its thread is left
/// behind. What such a thread still does changes nothing, and it does not hold up the process's end.
std::vector<SourceResult> runSources(const std::vector<Source>& sources, const SystemRoot& root,
                                     std::chrono::milliseconds deadline);

}  // namespace agent::discovery
