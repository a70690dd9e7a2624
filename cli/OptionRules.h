// Which command takes which options.
#pragma once

#include <cli/Options.h>

namespace cli {

/// Throws `UsageError` for an option that was given and that the command does not take, and for two that
/// contradict each other.
void checkThatOptionsApply(const CLI::App& app, Command command);

}  // namespace cli
