#include <arpa/inet.h>
#include <gnutls/gnutls.h>
#include <netinet/in.h>
#include <poll.h>
#include <strings.h>
#include <sys/socket.h>
#include <tests/support/HttpClient.h>
#include <unistd.h>

#include <array>
#include <cerrno>
#include <cstring>
#include <stdexcept>

namespace tests {
namespace {

constexpr int patience = 30'000;

bool sameName(std::string_view left, std::string_view right) {
  return left.size() == right.size() && strncasecmp(left.data(), right.data(), left.size()) == 0;
}

std::optional<std::string> find(const HttpFields& fields, std::string_view name) {
  for (const auto& [key, value] : fields) {
    if (sameName(key, name)) {
      return value;
    }
  }
  return std::nullopt;
}

[[noreturn]] void fail(const std::string& what) {
  throw std::runtime_error("HTTP client: " + what);
}

void waitFor(int descriptor, short events) {
  pollfd waiting{descriptor, events, 0};
  int ready = -1;
  do {
    ready = ::poll(&waiting, 1, patience);
  } while (ready < 0 && errno == EINTR);
  if (ready <= 0) {
    fail("the server did nothing for 30 seconds");
  }
}

int openSocket(std::uint16_t port, bool ipv6, int receiveBuffer) {
  const int descriptor = ::socket(ipv6 ? AF_INET6 : AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0);
  if (descriptor < 0) {
    fail(std::string("no socket: ") + std::strerror(errno));
  }
  if (receiveBuffer > 0) {
    ::setsockopt(descriptor, SOL_SOCKET, SO_RCVBUF, &receiveBuffer, sizeof receiveBuffer);
  }
  sockaddr_in6 six{};
  six.sin6_family = AF_INET6;
  six.sin6_port = htons(port);
  six.sin6_addr = in6addr_loopback;
  sockaddr_in four{};
  four.sin_family = AF_INET;
  four.sin_port = htons(port);
  four.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
  const auto* address = ipv6 ? reinterpret_cast<sockaddr*>(&six) : reinterpret_cast<sockaddr*>(&four);
  const socklen_t size = ipv6 ? sizeof six : sizeof four;
  if (::connect(descriptor, address, size) != 0) {
    const int error = errno;
    ::close(descriptor);
    fail(std::string("no connection: ") + std::strerror(error));
  }
  return descriptor;
}

gnutls_datum_t datum(const std::string& text) {
  return {reinterpret_cast<unsigned char*>(const_cast<char*>(text.data())),
          static_cast<unsigned>(text.size())};
}

}  // namespace

/// What carries the bytes. The end of the connection, however it comes, is 0.
class HttpConnection::Stream {
 public:
  explicit Stream(int descriptor) : descriptor_(descriptor) {}
  virtual ~Stream() { ::close(descriptor_); }
  Stream(const Stream&) = delete;
  Stream& operator=(const Stream&) = delete;

  virtual std::size_t write(std::string_view bytes) {
    waitFor(descriptor_, POLLOUT);
    const ssize_t count = ::send(descriptor_, bytes.data(), bytes.size(), MSG_NOSIGNAL);
    return count < 0 ? 0 : static_cast<std::size_t>(count);
  }

  virtual std::size_t read(char* buffer, std::size_t size) {
    waitFor(descriptor_, POLLIN);
    const ssize_t count = ::recv(descriptor_, buffer, size, 0);
    return count < 0 ? 0 : static_cast<std::size_t>(count);
  }

  virtual void finish() { ::shutdown(descriptor_, SHUT_WR); }

 protected:
  [[nodiscard]] int descriptor() const { return descriptor_; }

 private:
  int descriptor_;
};

namespace {

class Credentials {
 public:
  explicit Credentials(const HttpTls& tls) {
    gnutls_certificate_allocate_credentials(&credentials_);
    if (!tls.authorities.empty()) {
      const gnutls_datum_t authorities = datum(tls.authorities);
      gnutls_certificate_set_x509_trust_mem(credentials_, &authorities, GNUTLS_X509_FMT_PEM);
    }
    if (!tls.certificate.empty()) {
      const gnutls_datum_t certificate = datum(tls.certificate);
      const gnutls_datum_t key = datum(tls.key);
      gnutls_certificate_set_x509_key_mem(credentials_, &certificate, &key, GNUTLS_X509_FMT_PEM);
      // A certificate is shown to servers that ask for others' too: a test wants to see it refused.
      gnutls_certificate_set_flags(credentials_, GNUTLS_CERTIFICATE_SKIP_KEY_CERT_MATCH);
    }
  }
  ~Credentials() { gnutls_certificate_free_credentials(credentials_); }
  Credentials(const Credentials&) = delete;
  Credentials& operator=(const Credentials&) = delete;

  [[nodiscard]] gnutls_certificate_credentials_t get() const { return credentials_; }

 private:
  gnutls_certificate_credentials_t credentials_ = nullptr;
};

}  // namespace

class TlsStream : public HttpConnection::Stream {
 public:
  TlsStream(int descriptor, const HttpTls& tls) : Stream(descriptor), credentials_(tls) {
    gnutls_init(&session_, GNUTLS_CLIENT | GNUTLS_NO_SIGNAL | GNUTLS_FORCE_CLIENT_CERT);
    const char* wrong = nullptr;
    if (gnutls_priority_set_direct(session_, tls.priorities.c_str(), &wrong) != GNUTLS_E_SUCCESS) {
      gnutls_deinit(session_);
      fail(std::string("bad priorities at ") + wrong);
    }
    gnutls_credentials_set(session_, GNUTLS_CRD_CERTIFICATE, credentials_.get());
    if (!tls.authorities.empty()) {
      gnutls_session_set_verify_cert(session_, nullptr, 0);
    }
    gnutls_transport_set_int(session_, descriptor);
    gnutls_handshake_set_timeout(session_, patience);
    int error = 0;
    do {
      error = gnutls_handshake(session_);
    } while (error < 0 && gnutls_error_is_fatal(error) == 0);
    if (error < 0) {
      gnutls_deinit(session_);
      fail(std::string("no TLS: ") + gnutls_strerror(error));
    }
  }
  ~TlsStream() override { gnutls_deinit(session_); }
  TlsStream(const TlsStream&) = delete;
  TlsStream& operator=(const TlsStream&) = delete;

  std::size_t write(std::string_view bytes) override {
    ssize_t count = 0;
    do {
      count = gnutls_record_send(session_, bytes.data(), bytes.size());
    } while (count == GNUTLS_E_INTERRUPTED || count == GNUTLS_E_AGAIN);
    return count < 0 ? 0 : static_cast<std::size_t>(count);
  }

  std::size_t read(char* buffer, std::size_t size) override {
    ssize_t count = 0;
    do {
      if (gnutls_record_check_pending(session_) == 0) {
        waitFor(descriptor(), POLLIN);
      }
      count = gnutls_record_recv(session_, buffer, size);
    } while (count < 0 && gnutls_error_is_fatal(static_cast<int>(count)) == 0);
    return count < 0 ? 0 : static_cast<std::size_t>(count);
  }

  void finish() override { gnutls_bye(session_, GNUTLS_SHUT_WR); }

 private:
  Credentials credentials_;
  gnutls_session_t session_ = nullptr;
};

std::optional<std::string> HttpAnswer::field(std::string_view name) const {
  return find(fields, name);
}

std::optional<std::string> HttpAnswer::trailer(std::string_view name) const {
  return find(trailers, name);
}

std::string httpRequest(std::string_view method, std::string_view target, const HttpFields& fields,
                        std::string_view body, std::string_view version) {
  std::string text = std::string(method) + " " + std::string(target) + " " + std::string(version) + "\r\n";
  text += "Host: localhost\r\n";
  for (const auto& [name, value] : fields) {
    text.append(name).append(": ").append(value).append("\r\n");
  }
  if (!body.empty()) {
    text += "Content-Length: " + std::to_string(body.size()) + "\r\n";
  }
  return text.append("\r\n").append(body);
}

std::pair<std::string, std::string> basicLogin(std::string_view user, std::string_view password) {
  const std::string text = std::string(user) + ":" + std::string(password);
  const gnutls_datum_t plain = datum(text);
  gnutls_datum_t encoded{};
  gnutls_base64_encode2(&plain, &encoded);
  std::string value = "Basic " + std::string(reinterpret_cast<char*>(encoded.data), encoded.size);
  gnutls_free(encoded.data);
  return {"Authorization", value};
}

HttpConnection::HttpConnection(std::uint16_t port, bool ipv6, int receiveBuffer)
    : stream_(std::make_unique<Stream>(openSocket(port, ipv6, receiveBuffer))) {}

HttpConnection::HttpConnection(std::uint16_t port, const HttpTls& tls)
    : stream_(std::make_unique<TlsStream>(openSocket(port, false, 0), tls)) {}

HttpConnection::~HttpConnection() = default;
HttpConnection::HttpConnection(HttpConnection&& other) noexcept = default;
HttpConnection& HttpConnection::operator=(HttpConnection&& other) noexcept = default;

bool HttpConnection::send(std::string_view bytes) {
  while (!bytes.empty()) {
    const std::size_t count = stream_->write(bytes);
    if (count == 0) {
      return false;
    }
    bytes.remove_prefix(count);
  }
  return true;
}

void HttpConnection::finishSending() {
  stream_->finish();
}

bool HttpConnection::fill() {
  constexpr std::size_t atOnce = 65536;
  const std::size_t had = buffer_.size();
  buffer_.resize(had + atOnce);
  const std::size_t count = stream_->read(buffer_.data() + had, atOnce);
  buffer_.resize(had + count);
  return count > 0;
}

std::string HttpConnection::line() {
  std::size_t end = buffer_.find("\r\n");
  while (end == std::string::npos) {
    if (!fill()) {
      fail("the connection ended in a line: \"" + buffer_ + "\"");
    }
    end = buffer_.find("\r\n");
  }
  std::string text = buffer_.substr(0, end);
  buffer_.erase(0, end + 2);
  return text;
}

HttpFields HttpConnection::readFields() {
  HttpFields fields;
  for (std::string text = line(); !text.empty(); text = line()) {
    const std::size_t colon = text.find(':');
    if (colon == std::string::npos || colon == 0) {
      fail("a header without a name: \"" + text + "\"");
    }
    const std::size_t value = text.find_first_not_of(" \t", colon + 1);
    fields.emplace_back(text.substr(0, colon), value == std::string::npos ? "" : text.substr(value));
  }
  return fields;
}

HttpAnswer HttpConnection::readHead() {
  constexpr std::size_t statusAt = 9;
  constexpr std::size_t statusSize = 3;
  HttpAnswer answer;
  const std::string status = line();
  if (!status.starts_with("HTTP/1.") || status.size() < statusAt + statusSize) {
    fail("no status line: \"" + status + "\"");
  }
  answer.version = status.substr(0, statusAt - 1);
  answer.status = std::stoi(status.substr(statusAt, statusSize));
  answer.fields = readFields();
  answer.isChunked = answer.field("Transfer-Encoding") == "chunked";
  const auto length = answer.field("Content-Length");
  if (length && answer.isChunked) {
    fail("both a length and chunks");
  }
  left_.reset();
  constexpr int firstWithBody = 200;
  if (length) {
    left_ = std::stoull(*length);
  } else if (answer.status < firstWithBody) {
    left_ = 0;
  }
  return answer;
}

std::string HttpConnection::readPart(HttpAnswer& answer) {
  if (answer.isChunked) {
    constexpr int hexadecimal = 16;
    std::size_t digits = 0;
    const std::string header = line();
    const std::size_t size = std::stoull(header, &digits, hexadecimal);
    if (digits != header.size()) {
      fail("a bad chunk: \"" + header + "\"");
    }
    if (size == 0) {
      answer.trailers = readFields();
      answer.isComplete = true;
      return {};
    }
    while (buffer_.size() < size + 2) {
      if (!fill()) {
        fail("the connection ended in a chunk");
      }
    }
    std::string part = buffer_.substr(0, size);
    if (buffer_.compare(size, 2, "\r\n") != 0) {
      fail("a chunk without its end");
    }
    buffer_.erase(0, size + 2);
    answer.body += part;
    return part;
  }
  if (left_ == 0U) {
    answer.isComplete = true;
    return {};
  }
  if (buffer_.empty() && !fill()) {
    return {};
  }
  std::string part = buffer_.substr(0, left_.value_or(buffer_.size()));
  buffer_.erase(0, part.size());
  if (left_) {
    *left_ -= part.size();
  }
  answer.body += part;
  return part;
}

HttpAnswer HttpConnection::readAnswer(bool hasBody) {
  HttpAnswer answer = readHead();
  if (!hasBody) {
    answer.isComplete = true;
    return answer;
  }
  while (!readPart(answer).empty()) {
  }
  return answer;
}

HttpAnswer HttpConnection::ask(std::string_view request) {
  send(request);
  return readAnswer();
}

std::string HttpConnection::receive() {
  if (buffer_.empty()) {
    fill();
  }
  return std::exchange(buffer_, {});
}

bool HttpConnection::isClosed() {
  return receive().empty();
}

}  // namespace tests
