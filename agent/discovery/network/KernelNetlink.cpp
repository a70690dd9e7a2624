// Generic netlink of the running kernel.
#include <agent/discovery/AwaitReadable.h>
#include <agent/discovery/network/NetlinkChannel.h>

#include <linux/netlink.h>
#include <sys/socket.h>
#include <unistd.h>

#include <cerrno>

namespace agent::discovery {

namespace {

class KernelNetlink : public NetlinkChannel {
 public:
  explicit KernelNetlink(int socket) : socket_(socket) {}
  KernelNetlink(const KernelNetlink&) = delete;
  KernelNetlink& operator=(const KernelNetlink&) = delete;
  ~KernelNetlink() override { ::close(socket_); }

  int send(std::string_view request) override {
    return ::send(socket_, request.data(), request.size(), 0) < 0 ? errno : 0;
  }

  int await(std::chrono::milliseconds limit) override { return awaitReadable(socket_, limit); }

  Received receive() override {
    Received received;
    received.bytes.resize(longestAnswer);
    const ssize_t length = ::recv(socket_, received.bytes.data(), received.bytes.size(), MSG_TRUNC);
    if (length < 0) {
      return {errno, {}};
    }
    if (static_cast<std::size_t>(length) > longestAnswer) {
      return {EMSGSIZE, {}};
    }
    received.bytes.resize(static_cast<std::size_t>(length));
    return received;
  }

 private:
  static constexpr std::size_t longestAnswer = 65536;

  int socket_;
};

}  // namespace

NetlinkOpener kernelNetlink() {
  return []() -> OpenedNetlink {
    const int socket = ::socket(AF_NETLINK, SOCK_RAW | SOCK_CLOEXEC | SOCK_NONBLOCK, NETLINK_GENERIC);
    if (socket < 0) {
      return {nullptr, errno};
    }
    auto channel = std::make_unique<KernelNetlink>(socket);
    sockaddr_nl kernel{};  // port 0; a connected socket hears nobody else
    kernel.nl_family = AF_NETLINK;
    if (::connect(socket, reinterpret_cast<const sockaddr*>(&kernel), sizeof kernel) != 0) {
      return {nullptr, errno};
    }
    return {std::move(channel), 0};
  };
}

}  // namespace agent::discovery
