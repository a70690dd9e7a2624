// The IPMI device of the running kernel.
#include <agent/discovery/AwaitReadable.h>
#include <agent/discovery/ipmi/IpmiChannel.h>

#include <fcntl.h>
#include <linux/ipmi.h>
#include <sys/ioctl.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <cerrno>

namespace agent::discovery {

namespace {

class KernelIpmi : public IpmiChannel {
 public:
  explicit KernelIpmi(int descriptor) : descriptor_(descriptor) {}
  KernelIpmi(const KernelIpmi&) = delete;
  KernelIpmi& operator=(const KernelIpmi&) = delete;
  ~KernelIpmi() override { ::close(descriptor_); }

  int send(const Request& request) override {
    ipmi_system_interface_addr address{};
    address.addr_type = IPMI_SYSTEM_INTERFACE_ADDR_TYPE;
    address.channel = IPMI_BMC_CHANNEL;
    ipmi_req asked{};
    asked.addr = reinterpret_cast<unsigned char*>(&address);
    asked.addr_len = sizeof address;
    asked.msgid = request.id;
    asked.msg.netfn = request.function;
    asked.msg.cmd = request.command;
    return ::ioctl(descriptor_, IPMICTL_SEND_COMMAND, &asked) == 0 ? 0 : errno;
  }

  int awaitMessage(std::chrono::milliseconds limit) override { return awaitReadable(descriptor_, limit); }

  Received receive() override {
    ipmi_addr address{};
    std::array<unsigned char, longestMessage> buffer{};
    ipmi_recv message{};
    message.addr = reinterpret_cast<unsigned char*>(&address);
    message.addr_len = sizeof address;
    message.msg.data = buffer.data();
    message.msg.data_len = static_cast<unsigned short>(buffer.size());
    // A message longer than the buffer is cut: EMSGSIZE, and it is there all the same.
    if (::ioctl(descriptor_, IPMICTL_RECEIVE_MSG_TRUNC, &message) != 0 && errno != EMSGSIZE) {
      Received failed;
      failed.error = errno;
      return failed;
    }
    Received received;
    received.isAnswer = message.recv_type == IPMI_RESPONSE_RECV_TYPE;
    received.id = message.msgid;
    received.function = message.msg.netfn;
    received.command = message.msg.cmd;
    const std::size_t length = std::min<std::size_t>(message.msg.data_len, buffer.size());
    for (std::size_t i = 0; i < length; ++i) {
      received.bytes.push_back(static_cast<std::byte>(buffer.at(i)));
    }
    return received;
  }

 private:
  static constexpr std::size_t longestMessage = 272;  // IPMI_MAX_MSG_LENGTH

  int descriptor_;
};

}  // namespace

IpmiOpener kernelIpmi() {
  return [] {
    const std::string path = std::string("/") + ipmiDevice;
    const int descriptor = ::open(path.c_str(), O_RDWR | O_CLOEXEC | O_NONBLOCK);
    return descriptor < 0 ? OpenedIpmi{nullptr, errno}
                          : OpenedIpmi{std::make_unique<KernelIpmi>(descriptor), 0};
  };
}

}  // namespace agent::discovery
