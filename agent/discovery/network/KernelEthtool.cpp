// The ethtool ioctl of the running kernel.
#include <agent/discovery/network/Ethtool.h>

#include <linux/ethtool.h>
#include <linux/sockios.h>
#include <net/if.h>
#include <sys/ioctl.h>
#include <sys/socket.h>
#include <unistd.h>

#include <cerrno>
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
    if (socketError_ != 0) {
      return {socketError_, {}};
    }
    ifreq request{};
    if (interfaceName.size() >= sizeof request.ifr_name) {
      return {ENODEV, {}};
    }
    std::memcpy(request.ifr_name, interfaceName.data(), interfaceName.size());
    ethtool_drvinfo info{};
    info.cmd = ETHTOOL_GDRVINFO;
    request.ifr_data = reinterpret_cast<char*>(&info);
    if (::ioctl(socket_, SIOCETHTOOL, &request) != 0) {
      return {errno, {}};
    }
    return {0, std::string(reinterpret_cast<const char*>(&info), sizeof info)};
  }

 private:
  int socket_ = -1;
  int socketError_ = 0;
};

}  // namespace

std::shared_ptr<Ethtool> makeKernelEthtool() {
  return std::make_shared<KernelEthtool>();
}

}  // namespace agent::discovery
