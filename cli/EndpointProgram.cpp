// What `serve` and `passwd` are in swinv itself.
#include <cli/Endpoint.h>
#include <cli/Layout.h>
#include <cli/Messages.h>

#include <cerrno>
#include <system_error>

#include <unistd.h>

namespace cli {

void runEndpoint(const Options& /*options*/, Output& /*output*/, char* const* arguments) {
  const std::string program = ownLayout().endpoint.string();
  execv(program.c_str(), arguments);
  throw CommandError("cannot start " + program + ": " + std::generic_category().message(errno) +
                     "\nIt belongs to swinv; install or build swinv again.");
}

}  // namespace cli
