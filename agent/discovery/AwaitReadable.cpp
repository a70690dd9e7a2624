#include <agent/discovery/AwaitReadable.h>
#include <poll.h>

#include <algorithm>
#include <cerrno>
#include <climits>

namespace agent::discovery {

int awaitReadable(int descriptor, std::chrono::milliseconds limit) {
  pollfd waiting{descriptor, POLLIN, 0};
  const auto bounded = std::clamp<std::chrono::milliseconds::rep>(limit.count(), 0, INT_MAX);
  const int ready = ::poll(&waiting, 1, static_cast<int>(bounded));
  if (ready < 0) {
    return errno;
  }
  if (ready == 0) {
    return ETIMEDOUT;
  }
  return (waiting.revents & POLLIN) != 0 ? 0 : EIO;
}

}  // namespace agent::discovery
