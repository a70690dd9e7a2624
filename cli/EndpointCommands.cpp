// What `serve` and `passwd` are in the program of the endpoint.
#include <cli/Commands.h>
#include <cli/Endpoint.h>

namespace cli {

void runEndpoint(const Options& options, Output& output, char* const* /*arguments*/) {
  return options.command == Command::Serve ? runServe(options, output) : runPasswd(options, output);
}

}  // namespace cli
