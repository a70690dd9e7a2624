// Listening sockets, and the thread that accepts at them.
#pragma once

#include <cimom/http/Descriptor.h>
#include <cimom/http/ListenAddress.h>
#include <cimom/http/Settings.h>

#include <functional>
#include <string>
#include <thread>
#include <vector>

namespace cimom::http {

struct ListeningSocket {
  Descriptor descriptor;
  SocketAddress address;  ///< with the real port
  bool tls = false;
};

/// Opens the socket of a listener, or duplicates the inherited one. Throws std::runtime_error.
[[nodiscard]] ListeningSocket openListener(const Listener& listener);

/// Accepts connections until it is destroyed.
class Acceptor {
 public:
  /// Called on the acceptor's thread, for each connection.
  using Sink = std::function<void(Descriptor, const SocketAddress& peer, bool tls)>;
  using Report = std::function<void(const std::string& line)>;

  Acceptor(std::vector<ListeningSocket> sockets, Sink sink, Report report);
  ~Acceptor();
  Acceptor(const Acceptor&) = delete;
  Acceptor& operator=(const Acceptor&) = delete;

 private:
  void run();
  bool accept(const ListeningSocket& socket);

  const std::vector<ListeningSocket> sockets_;
  const Sink sink_;
  const Report report_;
  Descriptor end_;
  std::thread thread_;
};

}  // namespace cimom::http
