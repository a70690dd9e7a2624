#include <cli/Messages.h>
#include <cli/ServiceManager.h>

#include <algorithm>
#include <charconv>
#include <cstddef>
#include <cstdlib>
#include <cstring>
#include <ctime>
#include <optional>

#include <fcntl.h>
#include <sys/socket.h>
#include <sys/un.h>
#include <unistd.h>

namespace cli {
namespace {

constexpr int firstInherited = 3;
constexpr int mostInherited = 64;

std::string_view variable(const char* name) {
  const char* value = std::getenv(name);
  return value == nullptr ? std::string_view() : std::string_view(value);
}

template <typename Number>
std::optional<Number> numberIn(std::string_view text) {
  Number number{};
  const auto result = std::from_chars(text.data(), text.data() + text.size(), number);
  const bool isWhole = !text.empty() && result.ec == std::errc() && result.ptr == text.data() + text.size();
  return isWhole ? std::optional(number) : std::nullopt;
}

/// Names in the order of the descriptors, divided by colons.
std::string takeName(std::string_view& names) {
  const std::size_t end = std::min(names.find(':'), names.size());
  std::string name(names.substr(0, end));
  names.remove_prefix(std::min(end + 1, names.size()));
  return name;
}

std::vector<InheritedSocket> inheritedSockets() {
  const auto process = numberIn<pid_t>(variable("LISTEN_PID"));
  if (!process || *process != getpid()) {
    return {};  // meant for a parent, which did not clean up behind itself
  }
  const auto count = numberIn<int>(variable("LISTEN_FDS"));
  if (!count || *count < 0 || *count > mostInherited) {
    throw CommandError("LISTEN_FDS '" + std::string(variable("LISTEN_FDS")) +
                       "' is no number of sockets up to " + std::to_string(mostInherited));
  }
  std::vector<InheritedSocket> sockets;
  std::string_view names = variable("LISTEN_FDNAMES");
  for (int descriptor = firstInherited; descriptor < firstInherited + *count; ++descriptor) {
    if (fcntl(descriptor, F_SETFD, FD_CLOEXEC) != 0) {
      throw CommandError("LISTEN_FDS promises a socket as descriptor " + std::to_string(descriptor) +
                         ", which is not open");
    }
    sockets.push_back({descriptor, takeName(names)});
  }
  return sockets;
}

}  // namespace

std::vector<InheritedSocket> takeInheritedSockets() {
  std::vector<InheritedSocket> sockets = inheritedSockets();
  for (const char* name : {"LISTEN_PID", "LISTEN_FDS", "LISTEN_FDNAMES"}) {
    unsetenv(name);
  }
  return sockets;
}

void notifyServiceManager(std::string_view state) {
  const std::string_view path = variable("NOTIFY_SOCKET");
  sockaddr_un address{};
  if (path.empty() || path.size() >= sizeof(address.sun_path)) {
    return;
  }
  address.sun_family = AF_UNIX;
  path.copy(address.sun_path, path.size());
  if (path.front() == '@') {
    address.sun_path[0] = '\0';  // Linux: a name that is in no file system
  }
  const int channel = socket(AF_UNIX, SOCK_DGRAM | SOCK_CLOEXEC, 0);
  if (channel < 0) {
    return;
  }
  const auto length = static_cast<socklen_t>(offsetof(sockaddr_un, sun_path) + path.size());
  static_cast<void>(sendto(channel, state.data(), state.size(), MSG_NOSIGNAL,
                           reinterpret_cast<const sockaddr*>(&address), length));
  close(channel);
}

void notifyReloading() {
  timespec now{};
  clock_gettime(CLOCK_MONOTONIC, &now);
  constexpr long long microsecondsPerSecond = 1000000;
  constexpr long long nanosecondsPerMicrosecond = 1000;
  const long long time = now.tv_sec * microsecondsPerSecond + now.tv_nsec / nanosecondsPerMicrosecond;
  notifyServiceManager("RELOADING=1\nMONOTONIC_USEC=" + std::to_string(time));
}

}  // namespace cli
