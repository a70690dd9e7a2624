// Where a server listens, as text and as bytes.
#pragma once

#include <sys/socket.h>

#include <cstdint>
#include <string>
#include <string_view>

namespace cimom::http {

/// A TCP address with its port.
class SocketAddress {
 public:
  SocketAddress() = default;
  /// Takes what the kernel reported; other families than IPv4 and IPv6 have neither host nor port.
  SocketAddress(const sockaddr* address, socklen_t size);

  [[nodiscard]] const sockaddr* data() const;
  [[nodiscard]] socklen_t size() const { return size_; }
  [[nodiscard]] int family() const { return storage_.ss_family; }
  [[nodiscard]] bool isTcp() const { return family() == AF_INET || family() == AF_INET6; }
  [[nodiscard]] std::uint16_t port() const;

  /// Whether only this machine reaches it: 127.0.0.0/8, ::1, and the former mapped into IPv6.
  [[nodiscard]] bool isLoopback() const;

  /// "127.0.0.1:5988", "[::1]:5988".
  [[nodiscard]] std::string text() const;

  /// Who stands behind it, for bounds by address: the whole IPv4 address, or the first 64 bits of an IPv6
  /// one, because one subscriber has all addresses that share them.
  [[nodiscard]] std::string origin() const;

 private:
  sockaddr_storage storage_{};
  socklen_t size_ = 0;
};

/// Parses ADDRESS:PORT: an IPv4 address, an IPv6 address in brackets, or "localhost", which is 127.0.0.1.
/// Throws std::invalid_argument with a message for the user.
[[nodiscard]] SocketAddress parseListenAddress(std::string_view text);

}  // namespace cimom::http
