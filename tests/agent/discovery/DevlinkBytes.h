// Answers of generic netlink, byte by byte, and a kernel that gives them.
#pragma once

#include <agent/discovery/network/NetlinkChannel.h>

#include <cstdint>
#include <deque>
#include <map>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

namespace agent::discovery::test {

/// `hex` as bytes: two digits for one, blanks and line ends between them ignored.
std::string bytesOfHex(std::string_view hex);

/// A number as its bytes in this machine's order.
std::string number32(std::uint32_t number);

/// An attribute with its padding.
std::string attribute(std::uint16_t type, std::string_view value);

/// A message with its header and padding.
std::string message(std::uint16_t type, std::uint32_t sequence, std::string_view payload);

/// An error message; `error` is an errno value, 0 an acknowledgement.
std::string errorMessage(std::uint32_t sequence, int error);

/// The head of a message of generic netlink.
std::string generic(std::uint8_t command);

/// The attributes of a devlink answer, from lines "fixed NAME=VERSION", "running NAME=VERSION" and "stored
/// NAME=VERSION", ";" between two.
std::string devlinkAttributes(std::string_view lines);

/// The family number of devlink in the fakes.
inline constexpr std::uint16_t devlinkFamily = 0x1b;

/// The answer that tells this number.
std::string familyAnswer(std::uint32_t sequence);

/// What a fake kernel's drivers say by "BUS/DEVICE": lines as above, or an error.
struct DevlinkTold {
  std::string lines;
  int error = 0;
};

/// Opens channels to a kernel whose drivers say that; any other device gets ENODEV.
NetlinkOpener devlinkTelling(std::map<std::string, DevlinkTold> told);

/// A channel with answers that a test writes out beforehand.
class ScriptedNetlink : public NetlinkChannel {
 public:
  struct Script {
    std::deque<Received> answers;       ///< taken one by one; where there is none any more, none comes
    std::vector<std::string> requests;  ///< what was sent
    int sendError = 0;
    int awaited = 0;  ///< how often somebody waited
  };

  explicit ScriptedNetlink(std::shared_ptr<Script> script) : script_(std::move(script)) {}
  int send(std::string_view request) override;
  int await(std::chrono::milliseconds limit) override;
  Received receive() override;

 private:
  std::shared_ptr<Script> script_;
};

}  // namespace agent::discovery::test
