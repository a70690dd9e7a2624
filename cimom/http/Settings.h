// What a server is started with: where it listens, who may ask, and the bounds that keep it alive.
#pragma once

#include <chrono>
#include <cstddef>
#include <functional>
#include <string>
#include <string_view>
#include <vector>

namespace cimom::http {

enum class LogLevel {
  detail,   ///< what only somebody who looks for a fault wants to read
  info,     ///< what an administrator may want to know
  warning,  ///< a client was refused or cut
  error     ///< something of the server's own does not work
};

/// One place to listen at.
struct Listener {
  /// ADDRESS:PORT with a literal address, IPv6 in brackets, or "localhost" for 127.0.0.1: "127.0.0.1:5988",
  /// "[::1]:5989". Port 0 lets the system choose. Unused where `inherited` is set.
  std::string address;
  bool tls = false;
  /// A listening TCP socket that the process was started with (socket activation); -1: none. The server
  /// works on a duplicate of it and leaves it open.
  int inherited = -1;
};

struct Bounds {
  std::size_t header = 16UL * 1024;                ///< bytes of request line and headers; 431
  std::size_t body = 1024UL * 1024;                ///< bytes of a request's body; 413
  std::size_t bodies = 64UL * 1024 * 1024;         ///< bytes of all bodies held at once; 503
  std::size_t queue = 256UL * 1024;                ///< bytes of one answer that wait for the client
  std::size_t wholeAnswer = 32UL * 1024 * 1024;    ///< bytes of an answer to an HTTP/1.0 client; 500
  std::size_t wholeAnswers = 128UL * 1024 * 1024;  ///< bytes of all such answers held at once; 500
  std::size_t connections = 512;                   ///< at once, over all listeners
  std::size_t connectionsPerAddress = 256;         ///< at once, by IPv4 address or IPv6 /64
  std::size_t workers = 16;                        ///< handlers that work at once
  std::size_t keptWorkers = 2;                     ///< threads that stay when there is nothing to do
  std::chrono::milliseconds idle{30'000};          ///< silence on a connection that is to send a request
  std::chrono::milliseconds request{60'000};       ///< for one request to arrive, however busily it drips
  std::chrono::milliseconds stall{30'000};         ///< a client takes nothing of its answer
  std::chrono::milliseconds flush{10};             ///< a small piece of an answer waits for more to join it
  std::chrono::milliseconds loginDelay{500};       ///< after the first failed login; doubles with each
  std::chrono::milliseconds longestLoginDelay{10'000};  ///< no login waits for longer: 429
  std::chrono::milliseconds rememberedLogin{300'000};   ///< a login is not hashed anew for so long
  std::chrono::milliseconds rememberedFailure{
      300'000};  ///< an address's failed logins are forgotten after it
};

struct Settings {
  std::vector<Listener> listeners;

  std::string certificateFile;  ///< PEM, the server's own first, then the chain; for listeners with TLS
  std::string keyFile;          ///< PEM, without a passphrase
  /// PEM. Client certificates that one of these authorities signed are a login: `Request::user` is then the
  /// certificate's subject ("CN=console,O=Example"). Empty: no certificate is asked for.
  std::string clientCaFile;
  std::string passwordFile;  ///< as Passwords.h has it; empty: no login by password
  std::string realm = "WBEM";

  /// Targets that GET and HEAD reach without a login, without their query.
  std::vector<std::string> openTargets{"/healthz"};

  Bounds bounds;

  /// Where every line of the log goes; called on any thread, several at once. Must not throw.
  std::function<void(LogLevel, std::string_view)> log;
};

}  // namespace cimom::http
