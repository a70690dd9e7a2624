// The connections of a server: how many there are, from where, and which take too long.
#pragma once

#include <cimom/http/ListenAddress.h>
#include <cimom/http/Settings.h>
#include <cimom/http/Timer.h>

#include <atomic>
#include <map>
#include <mutex>
#include <string>
#include <unordered_map>
#include <vector>

namespace cimom::http {

struct Connection {
  std::string peer;    ///< for logs
  std::string origin;  ///< who is behind it, for bounds
  /// When it is cut, unless a whole request has arrived until then.
  std::atomic<Clock::time_point> due{Clock::time_point::max()};
  // The sending thread's alone.
  bool certificateSeen = false;
  std::string subject;  ///< of the client's certificate, verified
};

/// Any thread.
class Connections {
 public:
  explicit Connections(const Bounds& bounds) : bounds_(bounds) {}

  /// Counts a connection that was accepted; nullptr: there are too many, and `why` says of what. It lives
  /// until `leave` with the same descriptor, which must stay open until then.
  Connection* enter(int descriptor, const SocketAddress& peer, std::string& why);
  [[nodiscard]] Connection* find(int descriptor);
  void leave(int descriptor);

  /// Requests that have not arrived whole by then are late, whatever their time: the server is about to end.
  void awaitNoneAfter(Clock::time_point last);

  /// Shuts those down that have taken too long to send a request; returns their peers.
  std::vector<std::string> cutLate(Clock::time_point now);

 private:
  const Bounds& bounds_;
  std::mutex mutex_;
  std::map<int, Connection> connections_;
  Clock::time_point last_ = Clock::time_point::max();
  std::unordered_map<std::string, std::size_t> origins_;
};

}  // namespace cimom::http
