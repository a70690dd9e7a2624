// An HTTP client for tests: it sends bytes as they are given, broken ones too, and reads answers strictly.
//
// Nothing waits longer than 30 seconds: then std::runtime_error is thrown, as it is for an answer that is no
// HTTP.
#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace tests {

using HttpFields = std::vector<std::pair<std::string, std::string>>;

struct HttpAnswer {
  std::string version;  ///< "HTTP/1.1"
  int status = 0;
  HttpFields fields;
  std::string body;
  HttpFields trailers;
  bool isChunked = false;
  /// The last chunk, or as many bytes as were announced, came. Without either the connection's end is no
  /// proof.
  bool isComplete = false;

  /// The first field or trailer of this name, whatever its case.
  [[nodiscard]] std::optional<std::string> field(std::string_view name) const;
  [[nodiscard]] std::optional<std::string> trailer(std::string_view name) const;
};

/// PEM texts, and what a client offers.
struct HttpTls {
  std::string authorities;  ///< the server's certificate must come from one of these; empty: any will do
  std::string certificate;  ///< the client's own; empty: none
  std::string key;
  std::string priorities = "NORMAL";
};

/// A request as a client writes it. Content-Length is added for a body, Host always.
[[nodiscard]] std::string httpRequest(std::string_view method, std::string_view target,
                                      const HttpFields& fields = {}, std::string_view body = {},
                                      std::string_view version = "HTTP/1.1");

/// The field of a login with a password.
[[nodiscard]] std::pair<std::string, std::string> basicLogin(std::string_view user,
                                                             std::string_view password);

/// One connection, used by one thread at a time.
class HttpConnection {
 public:
  /// Connects to 127.0.0.1, or ::1. A small receive buffer lets the server feel a client that does not read.
  explicit HttpConnection(std::uint16_t port, bool ipv6 = false, int receiveBuffer = 0);
  /// Connects with TLS; throws std::runtime_error with the reason where the handshake fails.
  HttpConnection(std::uint16_t port, const HttpTls& tls);
  ~HttpConnection();
  HttpConnection(HttpConnection&& other) noexcept;
  HttpConnection& operator=(HttpConnection&& other) noexcept;
  HttpConnection(const HttpConnection&) = delete;
  HttpConnection& operator=(const HttpConnection&) = delete;

  /// False: the server has closed the connection.
  bool send(std::string_view bytes);
  /// No more will be sent.
  void finishSending();

  /// A whole answer. `hasBody` is false for the answer to HEAD.
  HttpAnswer readAnswer(bool hasBody = true);
  HttpAnswer ask(std::string_view request);

  /// The head of an answer alone, to be followed by `readPart`s.
  HttpAnswer readHead();
  /// The next chunk, or what has come of a body of known length; empty: the body's end. Fills in `answer`.
  std::string readPart(HttpAnswer& answer);

  /// Waits until the server closes; false: it sent something instead.
  bool isClosed();
  /// Takes some bytes as they come; empty: the connection's end.
  std::string receive();

  class Stream;

 private:
  std::string line();
  bool fill();
  HttpFields readFields();

  std::unique_ptr<Stream> stream_;
  std::string buffer_;
  std::optional<std::size_t> left_;  ///< bytes of the body that were announced and not read
};

}  // namespace tests
