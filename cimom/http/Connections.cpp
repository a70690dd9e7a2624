#include <cimom/http/Connections.h>

#include <sys/socket.h>
#include <algorithm>

namespace cimom::http {

Connection* Connections::enter(int descriptor, const SocketAddress& peer, std::string& why) {
  const std::lock_guard lock(mutex_);
  if (connections_.size() >= bounds_.connections) {
    why = "there are " + std::to_string(connections_.size()) + " connections";
    return nullptr;
  }
  const std::string origin = peer.origin();
  std::size_t& count = origins_[origin];
  if (count >= bounds_.connectionsPerAddress) {
    why = "its address has " + std::to_string(count) + " connections";
    return nullptr;
  }
  ++count;
  Connection& connection = connections_[descriptor];
  connection.peer = peer.text();
  connection.origin = origin;
  connection.due = Clock::now() + bounds_.idle + bounds_.request;
  return &connection;
}

Connection* Connections::find(int descriptor) {
  const std::lock_guard lock(mutex_);
  const auto found = connections_.find(descriptor);
  return found == connections_.end() ? nullptr : &found->second;
}

void Connections::leave(int descriptor) {
  const std::lock_guard lock(mutex_);
  const auto found = connections_.find(descriptor);
  if (found == connections_.end()) {
    return;
  }
  const auto origin = origins_.find(found->second.origin);
  if (--origin->second == 0) {
    origins_.erase(origin);
  }
  connections_.erase(found);
}

void Connections::awaitNoneAfter(Clock::time_point last) {
  const std::lock_guard lock(mutex_);
  last_ = last;
}

std::vector<std::string> Connections::cutLate(Clock::time_point now) {
  std::vector<std::string> cut;
  const std::lock_guard lock(mutex_);
  for (auto& [descriptor, connection] : connections_) {
    const Clock::time_point due = connection.due;
    const bool isAwaited = due != Clock::time_point::max();
    if (isAwaited && std::min(due, last_) < now) {
      connection.due = Clock::time_point::max();
      ::shutdown(descriptor, SHUT_RDWR);
      cut.push_back(connection.peer);
    }
  }
  return cut;
}

}  // namespace cimom::http
