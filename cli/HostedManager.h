// The CIM object manager of this process: the installed schema and providers, and what the options add.
#pragma once

#include <cimom/ObjectManager.h>
#include <cli/Options.h>

#include <memory>

namespace cli {

/// Reads schema and registrations. Throws `CommandError`.
std::unique_ptr<cimom::ObjectManager> makeManager(const Options& options);

}  // namespace cli
