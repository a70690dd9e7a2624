// The machine that a command is about: the one source for the provider and for the commands that read the
// tree themselves.
#pragma once

#include <agent/framework/TreeSource.h>
#include <cli/Options.h>

namespace cli {

/// Puts what the options say about source and logging into the environment, where the framework reads it when
/// the provider is loaded. Call before any thread is started.
void setEnvironment(const Options& options);

/// The source that the environment names, which must be there: throws `CommandError` for an inventory file or
/// a system root that is missing.
agent::TreeSource checkedSource();

/// Reads the tree of `source`. Throws `CommandError` with the file, the line and the field.
agent::NodeTree readTreeOf(const agent::TreeSource& source);

}  // namespace cli
