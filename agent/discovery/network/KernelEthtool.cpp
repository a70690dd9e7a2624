// The ethtool ioctl of the running kernel.
#include <agent/discovery/network/Ethtool.h>

#include <linux/ethtool.h>
#include <linux/sockios.h>
#include <net/if.h>
#include <sys/ioctl.h>
#include <sys/socket.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <cerrno>
#include <cstddef>
#include <cstdint>
#include <cstring>

namespace agent::discovery {

namespace {

class KernelEthtool : public Ethtool {
 public:
  KernelEthtool() : socket_(::socket(AF_INET, SOCK_DGRAM | SOCK_CLOEXEC, 0)) {
    if (socket_ < 0) {  // a kernel without IPv4
      socket_ = ::socket(AF_UNIX, SOCK_DGRAM | SOCK_CLOEXEC, 0);
    }
    socketError_ = socket_ < 0 ? errno : 0;
  }
  KernelEthtool(const KernelEthtool&) = delete;
  KernelEthtool& operator=(const KernelEthtool&) = delete;
  ~KernelEthtool() override {
    if (socket_ >= 0) {
      ::close(socket_);
    }
  }

  Answer driverInfo(const std::string& interfaceName) override {
    ethtool_drvinfo info{};
    info.cmd = ETHTOOL_GDRVINFO;
    if (const int error = ask(interfaceName, &info)) {
      return {error, {}};
    }
    return {0, std::string(reinterpret_cast<const char*>(&info), sizeof info)};
  }

  Answer permanentAddress(const std::string& interfaceName) override {
    // The bytes of the address follow the request, which ends in an array without a size.
    constexpr std::size_t head = sizeof(ethtool_perm_addr);
    alignas(ethtool_perm_addr) std::array<char, head + longestAddress> asked{};
    ethtool_perm_addr request{};
    request.cmd = ETHTOOL_GPERMADDR;
    request.size = longestAddress;
    std::memcpy(asked.data(), &request, head);
    if (const int error = ask(interfaceName, asked.data())) {
      return {error, {}};
    }
    std::memcpy(&request, asked.data(), head);
    return {0, std::string(asked.data() + head, std::min(request.size, longestAddress))};
  }

 private:
  static constexpr std::uint32_t longestAddress = 32;  // MAX_ADDR_LEN

  /// Makes a request, which the answer replaces; 0, or an errno value.
  int ask(const std::string& interfaceName, void* asked) {
    if (socketError_ != 0) {
      return socketError_;
    }
    ifreq request{};
    if (interfaceName.size() >= sizeof request.ifr_name) {
      return ENODEV;
    }
    std::memcpy(request.ifr_name, interfaceName.data(), interfaceName.size());
    request.ifr_data = static_cast<char*>(asked);
    return ::ioctl(socket_, SIOCETHTOOL, &request) == 0 ? 0 : errno;
  }

  int socket_ = -1;
  int socketError_ = 0;
};

}  // namespace

std::shared_ptr<Ethtool> makeKernelEthtool() {
  return std::make_shared<KernelEthtool>();
}

}  // namespace agent::discovery
