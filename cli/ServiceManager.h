// The service manager that this process may have been started by, over the protocol of sd_notify(3) and
// sd_listen_fds(3). Without one, all of it does nothing.
#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace cli {

struct InheritedSocket {
  int descriptor;
  std::string name;  ///< FileDescriptorName= of the socket unit; empty: none was given
};

/// Sockets that this process was started with, none of them for its children. Takes them out of the
/// environment; call before any thread is started. Throws `CommandError` where the environment makes no
/// sense.
std::vector<InheritedSocket> takeInheritedSockets();

/// Tells the service manager, in its words: "READY=1". That nobody listens is no failure.
void notifyServiceManager(std::string_view state);

/// "RELOADING=1" with the time that goes with it.
void notifyReloading();

}  // namespace cli
