// The commands. Each prints to `output` and throws `CommandError` where its request fails; what was printed
// before is then whole in its format.
#pragma once

#include <cli/Options.h>
#include <cli/Output.h>

namespace cli {

void runList(const Options& options, Output& output);
void runNames(const Options& options, Output& output);
void runGet(const Options& options, Output& output);
void runAssociators(const Options& options, Output& output);
void runTree(const Options& options, Output& output);
void runCapture(const Options& options, Output& output);
void runRegister(const Options& options, Output& output);
void runUnregister(const Options& options, Output& output);

// In the program of the endpoint alone (cli/Endpoint.h).
void runServe(const Options& options, Output& output);
void runPasswd(const Options& options, Output& output);

}  // namespace cli
