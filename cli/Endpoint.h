// The commands of the WBEM endpoint, which are in a program of their own.
#pragma once

#include <cli/Options.h>
#include <cli/Output.h>

namespace cli {

/// Runs `serve` or `passwd`. HTTP, TLS and password hashes bring libraries that take longer to load than most
/// inventories take to print. So swinv itself does without them: there, this process becomes
/// ../libexec/swinv-endpoint, with the same arguments, and does not return. Throws `CommandError`.
void runEndpoint(const Options& options, Output& output, char* const* arguments);

}  // namespace cli
