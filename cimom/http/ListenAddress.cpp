#include <arpa/inet.h>
#include <cimom/http/ListenAddress.h>
#include <netinet/in.h>

#include <algorithm>
#include <array>
#include <charconv>
#include <cstring>
#include <stdexcept>

namespace cimom::http {
namespace {

template <typename Address>
Address as(const sockaddr_storage& storage) {
  Address address{};
  std::memcpy(&address, &storage, sizeof address);
  return address;
}

template <typename Address>
SocketAddress from(const Address& address) {
  sockaddr_storage storage{};
  std::memcpy(&storage, &address, sizeof address);
  return {reinterpret_cast<const sockaddr*>(&storage), sizeof address};
}

[[noreturn]] void refuse(std::string_view text, std::string_view why) {
  throw std::invalid_argument("cannot listen at \"" + std::string(text) + "\": " + std::string(why) +
                              "; give ADDRESS:PORT, such as 127.0.0.1:5988 or [::1]:5988");
}

std::uint16_t parsePort(std::string_view digits, std::string_view text) {
  std::uint16_t port = 0;
  const auto* end = digits.data() + digits.size();
  const auto [stop, error] = std::from_chars(digits.data(), end, port);
  if (error != std::errc() || stop != end) {
    refuse(text, "the port is no number from 0 to 65535");
  }
  return port;
}

bool isLoopbackV6(const in6_addr& address) {
  constexpr std::size_t mappedAt = 12;
  return IN6_IS_ADDR_LOOPBACK(&address) ||
         (IN6_IS_ADDR_V4MAPPED(&address) && address.s6_addr[mappedAt] == IN_LOOPBACKNET);
}

}  // namespace

SocketAddress::SocketAddress(const sockaddr* address, socklen_t size)
    : size_(std::min(size, static_cast<socklen_t>(sizeof storage_))) {
  if (address != nullptr) {
    std::memcpy(&storage_, address, size_);
  }
}

const sockaddr* SocketAddress::data() const {
  return reinterpret_cast<const sockaddr*>(&storage_);
}

std::uint16_t SocketAddress::port() const {
  switch (family()) {
    case AF_INET:
      return ntohs(as<sockaddr_in>(storage_).sin_port);
    case AF_INET6:
      return ntohs(as<sockaddr_in6>(storage_).sin6_port);
    default:
      return 0;
  }
}

bool SocketAddress::isLoopback() const {
  constexpr unsigned firstByte = 24;
  switch (family()) {
    case AF_INET:
      return ntohl(as<sockaddr_in>(storage_).sin_addr.s_addr) >> firstByte == IN_LOOPBACKNET;
    case AF_INET6:
      return isLoopbackV6(as<sockaddr_in6>(storage_).sin6_addr);
    default:
      return false;
  }
}

std::string SocketAddress::text() const {
  std::array<char, INET6_ADDRSTRLEN> host{};
  if (family() == AF_INET) {
    const auto address = as<sockaddr_in>(storage_);
    inet_ntop(AF_INET, &address.sin_addr, host.data(), host.size());
    return std::string(host.data()) + ":" + std::to_string(port());
  }
  if (family() == AF_INET6) {
    const auto address = as<sockaddr_in6>(storage_);
    inet_ntop(AF_INET6, &address.sin6_addr, host.data(), host.size());
    return "[" + std::string(host.data()) + "]:" + std::to_string(port());
  }
  return "(no TCP address)";
}

std::string SocketAddress::origin() const {
  constexpr std::size_t prefix = 8;
  constexpr std::size_t mappedAt = 12;
  if (family() == AF_INET) {
    const auto address = as<sockaddr_in>(storage_).sin_addr;
    return {reinterpret_cast<const char*>(&address), sizeof address};
  }
  const auto address = as<sockaddr_in6>(storage_).sin6_addr;
  const std::string bytes(reinterpret_cast<const char*>(&address), sizeof address);
  return IN6_IS_ADDR_V4MAPPED(&address) ? bytes.substr(mappedAt) : bytes.substr(0, prefix);
}

SocketAddress parseListenAddress(std::string_view text) {
  const std::size_t colon = text.rfind(':');
  if (colon == std::string_view::npos) {
    refuse(text, "there is no port");
  }
  std::string host(text.substr(0, colon));
  const std::uint16_t port = parsePort(text.substr(colon + 1), text);
  // What inet_pton reads ends at a NUL, and what follows it would be ignored.
  if (host.find('\0') != std::string::npos) {
    refuse(text, "the address is none");
  }
  if (host.size() >= 2 && host.front() == '[' && host.back() == ']') {
    sockaddr_in6 address{};
    address.sin6_family = AF_INET6;
    address.sin6_port = htons(port);
    if (inet_pton(AF_INET6, host.substr(1, host.size() - 2).c_str(), &address.sin6_addr) != 1) {
      refuse(text, "what stands in the brackets is no IPv6 address");
    }
    return from(address);
  }
  sockaddr_in address{};
  address.sin_family = AF_INET;
  address.sin_port = htons(port);
  if (host == "localhost") {
    host = "127.0.0.1";
  }
  if (inet_pton(AF_INET, host.c_str(), &address.sin_addr) != 1) {
    refuse(text, host.find(':') == std::string::npos ? "the address is none"
                                                     : "an IPv6 address stands in brackets");
  }
  return from(address);
}

}  // namespace cimom::http
