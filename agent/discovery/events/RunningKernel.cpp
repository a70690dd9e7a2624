// The running kernel: its messages about objects, and its name of the host.
#include <agent/discovery/events/KernelChannel.h>

#include <fcntl.h>
#include <linux/netlink.h>
#include <poll.h>
#include <sys/eventfd.h>
#include <sys/socket.h>
#include <unistd.h>

#include <array>
#include <cerrno>
#include <cstddef>
#include <cstdint>
#include <system_error>
#include <utility>

namespace agent::discovery {
namespace {

[[noreturn]] void fail(const char* what) {
  throw std::system_error(errno, std::generic_category(), what);
}

class Descriptor {
 public:
  Descriptor() = default;
  /// Throws what `errno` tells where there is none.
  Descriptor(int number, const char* what) : number_(number) {
    if (number < 0) {
      fail(what);
    }
  }
  Descriptor(Descriptor&& other) noexcept : number_(std::exchange(other.number_, -1)) {}
  Descriptor& operator=(Descriptor&& other) noexcept {
    std::swap(number_, other.number_);
    return *this;
  }
  ~Descriptor() {
    if (number_ >= 0) {
      ::close(number_);
    }
  }
  [[nodiscard]] int number() const { return number_; }

 private:
  int number_ = -1;
};

class RunningKernel : public KernelChannel {
 public:
  RunningKernel() : stop_(::eventfd(0, EFD_CLOEXEC | EFD_NONBLOCK), "eventfd") {}

  void open() override {
    objects_ = objectMessages();
    hostName_ = Descriptor(::open(hostNamePath, O_RDONLY | O_CLOEXEC), hostNamePath);
    knownName_ = hostName();
  }

  bool wait() override {
    std::array<pollfd, 3> waiting{
        {{stop_.number(), POLLIN, 0}, {objects_.number(), POLLIN, 0}, {hostName_.number(), POLLPRI, 0}}};
    while (::poll(waiting.data(), waiting.size(), -1) < 0) {
      if (errno != EINTR) {
        fail("poll");
      }
    }
    return waiting.front().revents == 0;
  }

  bool pause(std::chrono::milliseconds time) override {
    pollfd stopping{stop_.number(), POLLIN, 0};
    const Time end = now() + time;
    for (;;) {
      const auto left = std::chrono::ceil<std::chrono::milliseconds>(end - now());
      const int ready = left.count() > 0 ? ::poll(&stopping, 1, static_cast<int>(left.count())) : 0;
      if (ready < 0 && errno != EINTR) {
        fail("poll");
      }
      if (ready >= 0) {
        return ready == 0;
      }
    }
  }

  std::optional<KernelNews> take() override {
    if (std::optional<KernelNews> news = takeMessage()) {
      return news;
    }
    // By its text: a system that reports the file as changed at every question renames nothing.
    std::string name = hostName();
    if (name == knownName_) {
      return std::nullopt;
    }
    knownName_ = std::move(name);
    return KernelNews{KernelNews::Kind::HostName};
  }

  [[nodiscard]] Time now() const override { return std::chrono::steady_clock::now(); }

  void stop() noexcept override {
    const std::uint64_t one = 1;
    // Fails only where it is stopped 2^64 times over.
    [[maybe_unused]] const ssize_t written = ::write(stop_.number(), &one, sizeof one);
  }

 private:
  static constexpr const char* hostNamePath = "/proc/sys/kernel/hostname";
  static constexpr unsigned int fromKernel = 1;  ///< the group; udev's messages go to another

  static Descriptor objectMessages() {
    constexpr const char* what = "the socket for events of the kernel";
    Descriptor socket(::socket(AF_NETLINK, SOCK_DGRAM | SOCK_CLOEXEC | SOCK_NONBLOCK, NETLINK_KOBJECT_UEVENT),
                      what);
    sockaddr_nl address{};
    address.nl_family = AF_NETLINK;
    address.nl_groups = fromKernel;
    if (::bind(socket.number(), reinterpret_cast<const sockaddr*>(&address), sizeof address) != 0) {
      fail(what);
    }
    return socket;
  }

  [[nodiscard]] std::string hostName() const {
    std::array<char, 256> text{};
    const ssize_t length = ::pread(hostName_.number(), text.data(), text.size(), 0);
    return length > 0 ? std::string(text.data(), static_cast<std::size_t>(length)) : knownName_;
  }

  [[nodiscard]] std::optional<KernelNews> takeMessage() const {
    std::array<char, 8192> bytes{};
    const ssize_t received = ::recv(objects_.number(), bytes.data(), bytes.size(), 0);
    if (received >= 0) {
      return KernelNews{KernelNews::Kind::Object,
                        std::string(bytes.data(), static_cast<std::size_t>(received))};
    }
    if (errno == ENOBUFS) {
      return KernelNews{KernelNews::Kind::Lost};
    }
    if (errno != EAGAIN && errno != EINTR) {
      fail("reading the events of the kernel");
    }
    return std::nullopt;
  }

  Descriptor stop_;
  Descriptor objects_;
  Descriptor hostName_;
  std::string knownName_;
};

}  // namespace

std::unique_ptr<KernelChannel> kernelChannel() {
  return std::make_unique<RunningKernel>();
}

}  // namespace agent::discovery
