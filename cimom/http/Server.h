// HTTP as the WBEM endpoint needs it: requests come whole, answers go out while they are made.
//
// Nothing here knows CIM.
#pragma once

#include <cimom/http/Settings.h>

#include <chrono>
#include <cstdint>
#include <functional>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

namespace cimom::http {

struct Field {
  std::string name;
  std::string value;
};

struct Request {
  std::string method;  ///< as sent: "POST", "M-POST", "GET"
  std::string target;  ///< as sent, with the query: "/cimom"
  bool isHttp10 = false;
  std::vector<Field> fields;   ///< headers, in the order they came in
  std::string body;            ///< whole, within the server's bound
  std::string user;            ///< who logged in, by password or certificate; empty: nobody had to
  std::string peer;            ///< address and port, for logs
  bool takesTrailers = false;  ///< the client sent "TE: trailers", and the answer may be chunked

  /// The first header of this name, whatever its case; nullptr where there is none.
  [[nodiscard]] const std::string* field(std::string_view name) const;
};

/// The answer to one request, written on the thread that handles it. An answer on which nothing was called
/// when the handler returns, or whose handler threw before `begin`, is a 500.
class Answer {
 public:
  virtual ~Answer() = default;

  /// The status line and headers, once, before everything else. Nothing goes out yet: the headers leave with
  /// the first bytes of the body, or when the handler has returned. Content-Length, Transfer-Encoding,
  /// Connection and Date are the server's own and left out here; a Trailer field names what `fail` may send,
  /// and goes out only where trailers can. Called twice without a `fail` that took the first back, it throws
  /// std::logic_error.
  virtual void begin(int status, std::vector<Field> fields) = 0;

  /// More of the body; pieces of some kilobytes are best. Blocks while the client is slower than the handler
  /// and the queue between them is full. False: the client is gone or was too slow, and nothing more will
  /// reach it.
  virtual bool write(std::string_view bytes) = 0;

  /// Ends an answer that cannot be completed. If nothing left yet, `begin` may be called anew (false is
  /// returned by `started`). Otherwise the trailers go out where the client takes them, else the connection
  /// is closed without its last chunk, so that the client sees that the answer is not whole.
  virtual void fail(std::vector<Field> trailers) = 0;

  /// Whether bytes may have left for the client: from then on the status line cannot change.
  [[nodiscard]] virtual bool started() const = 0;
};

/// Called on a worker thread, for several requests at once.
using Handler = std::function<void(const Request&, Answer&)>;

/// Listens from its construction to `stop` or its destruction. Its functions may be called from any thread.
class Server {
 public:
  /// Throws std::runtime_error, with a message for the administrator, where the settings are not safe (a
  /// listener that others than this machine reach needs TLS and a login), a file cannot be used or an
  /// address cannot be listened at.
  Server(Settings settings, Handler handler);

  /// Cuts what is still under way and waits for its handlers. Call `stop` before to let requests finish.
  ~Server();
  Server(const Server&) = delete;
  Server& operator=(const Server&) = delete;

  /// Where it listens, in the order of the settings: "127.0.0.1:5988", "[::1]:5989", with the real port.
  [[nodiscard]] std::vector<std::string> addresses() const;

  /// The port of the listener at this position.
  [[nodiscard]] std::uint16_t port(std::size_t listener = 0) const;

  /// Reads certificates, authorities and passwords again. New connections get the new ones; on those that are
  /// there what is under way goes on, and the next answer ends the connection. What cannot be used is
  /// reported, in the log too, and the old stays. Empty: everything was read.
  std::vector<std::string> reload();

  /// Takes no new connections, waits until what is under way is finished, for `patience` at most, then closes
  /// everything. False: requests were cut, and handlers may still run; the destructor waits for them.
  bool stop(std::chrono::milliseconds patience);

  /// Requests that were read or answered at this moment.
  [[nodiscard]] std::size_t requestsUnderWay() const;

 private:
  class Core;
  std::unique_ptr<Core> core_;
};

}  // namespace cimom::http
