#include <arpa/inet.h>
#include <bench/serve/Connection.h>
#include <netinet/in.h>
#include <netinet/tcp.h>
#include <sys/socket.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <cerrno>
#include <cstdlib>
#include <stdexcept>
#include <system_error>

namespace bench {

namespace {

[[noreturn]] void fail(const char* what) {
  throw std::system_error(errno, std::generic_category(), what);
}

}  // namespace

Connection::Connection(std::uint16_t port) : socket_(socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0)) {
  if (socket_ < 0) {
    fail("socket");
  }
  sockaddr_in address{};
  address.sin_family = AF_INET;
  address.sin_port = htons(port);
  address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
  if (connect(socket_, reinterpret_cast<const sockaddr*>(&address), sizeof address) != 0) {
    fail("connect");
  }
  const int on = 1;
  setsockopt(socket_, IPPROTO_TCP, TCP_NODELAY, &on, sizeof on);
}

Connection::~Connection() {
  close(socket_);
}

void Connection::send(std::string_view request) {
  part_ = Part::Head;
  line_.clear();
  tail_.clear();
  body_ = 0;
  objects_ = 0;
  while (!request.empty()) {
    const ssize_t sent = ::send(socket_, request.data(), request.size(), MSG_NOSIGNAL);
    if (sent < 0) {
      fail("send");
    }
    request.remove_prefix(static_cast<std::size_t>(sent));
  }
}

bool Connection::receive(bool wait) {
  static thread_local std::array<char, std::size_t{1} << 18U> buffer;
  for (;;) {
    const ssize_t got = recv(socket_, buffer.data(), buffer.size(), wait ? 0 : MSG_DONTWAIT);
    if (got < 0 && (errno == EAGAIN || errno == EINTR)) {
      return false;
    }
    if (got < 0) {
      fail("recv");
    }
    if (got == 0) {
      throw std::runtime_error("the connection was closed within an answer");
    }
    if (take({buffer.data(), static_cast<std::size_t>(got)})) {
      return true;
    }
  }
}

bool Connection::takeLine(std::string_view& bytes) {
  const std::size_t end = bytes.find('\n');
  line_.append(bytes.substr(0, end));
  if (end == std::string_view::npos) {
    bytes = {};
    return false;
  }
  bytes.remove_prefix(end + 1);
  return true;
}

bool Connection::take(std::string_view bytes) {
  while (!bytes.empty()) {
    if (part_ == Part::Chunk || part_ == Part::Sized) {
      const std::size_t piece = std::min(left_, bytes.size());
      takeBody(bytes.substr(0, piece));
      bytes.remove_prefix(piece);
      left_ -= piece;
      if (left_ == 0 && part_ == Part::Sized) {
        return true;
      }
      part_ = left_ == 0 ? Part::ChunkEnd : part_;
      continue;
    }
    if (!takeLine(bytes)) {
      return false;
    }
    if (part_ == Part::Head) {
      line_ += '\n';
      if (line_.ends_with("\r\n\r\n")) {
        readHead();
      }
    } else if (part_ == Part::ChunkHead) {
      left_ = std::strtoul(line_.c_str(), nullptr, 16);
      part_ = left_ == 0 ? Part::Trailer : Part::Chunk;
      line_.clear();
    } else if (part_ == Part::ChunkEnd) {
      part_ = Part::ChunkHead;
      line_.clear();
    } else {
      const bool last = line_ == "\r";
      line_.clear();
      if (last) {
        return true;
      }
    }
  }
  return false;
}

void Connection::readHead() {
  if (!line_.starts_with("HTTP/1.1 200 ")) {
    throw std::runtime_error("the endpoint answered " + line_.substr(0, line_.find('\r')));
  }
  const std::size_t length = line_.find("Content-Length: ");
  if (length == std::string::npos) {
    part_ = Part::ChunkHead;
  } else {
    left_ = std::strtoul(line_.c_str() + length + 16, nullptr, 10);
    part_ = Part::Sized;
  }
  line_.clear();
}

void Connection::takeBody(std::string_view bytes) {
  body_ += bytes.size();
  if (counted_.empty()) {
    return;
  }
  tail_ += bytes;
  std::size_t from = 0;
  for (std::size_t at = 0; (at = tail_.find(counted_, at)) != std::string::npos; from = at) {
    ++objects_;
    at += counted_.size();
  }
  from = std::max(from, tail_.size() - std::min(tail_.size(), counted_.size() - 1));
  tail_.erase(0, from);
}

std::string cimRequest(const std::string& operation, const std::string& parameters) {
  const std::string body =
      R"(<?xml version="1.0" encoding="utf-8"?><CIM CIMVERSION="2.0" DTDVERSION="2.0"><MESSAGE ID="1" )"
      R"(PROTOCOLVERSION="1.0"><SIMPLEREQ><IMETHODCALL NAME=")" +
      operation +
      R"("><LOCALNAMESPACEPATH><NAMESPACE NAME="root"/><NAMESPACE NAME="cimv2"/></LOCALNAMESPACEPATH>)" +
      parameters + "</IMETHODCALL></SIMPLEREQ></MESSAGE></CIM>";
  return "POST /cimom HTTP/1.1\r\nHost: localhost\r\nContent-Type: application/xml; charset=utf-8\r\n"
         "CIMOperation: MethodCall\r\nCIMMethod: " +
         operation + "\r\nCIMObject: root%2Fcimv2\r\nContent-Length: " + std::to_string(body.size()) +
         "\r\n\r\n" + body;
}

}  // namespace bench
