#include "DevlinkBytes.h"

#include <agent/discovery/network/Netlink.h>

#include <linux/devlink.h>
#include <linux/genetlink.h>
#include <linux/netlink.h>

#include <algorithm>
#include <cerrno>
#include <stdexcept>
#include <utility>

namespace agent::discovery::test {

namespace {

template <typename Number>
std::string raw(Number number) {
  return {reinterpret_cast<const char*>(&number), sizeof number};
}

std::string padded(std::string bytes) {
  bytes.resize((bytes.size() + 3) / 4 * 4, '\0');
  return bytes;
}

std::string text(std::uint16_t type, std::string_view value) {
  return attribute(type, std::string(value) + '\0');
}

/// Answers each request as the kernel does: within the sending call.
class FakeKernel : public NetlinkChannel {
 public:
  explicit FakeKernel(std::shared_ptr<const std::map<std::string, DevlinkTold>> told)
      : told_(std::move(told)) {}

  int send(std::string_view request) override {
    const netlink::Message asked = netlink::takeMessage(request).value();
    const netlink::GenericMessage generic = netlink::parseGeneric(asked.payload).value();
    answers_.push_back(asked.type == GENL_ID_CTRL ? familyAnswer(asked.sequence)
                                                  : answer(asked.sequence, generic.attributes));
    return 0;
  }
  int await(std::chrono::milliseconds /*limit*/) override { return answers_.empty() ? ETIMEDOUT : 0; }
  Received receive() override {
    Received received{0, answers_.front()};
    answers_.pop_front();
    return received;
  }

 private:
  [[nodiscard]] std::string answer(std::uint32_t sequence, std::string_view attributes) const {
    const auto name = [&](std::uint16_t type) {
      return std::string(netlink::textOf(netlink::findAttribute(attributes, type).value()));
    };
    const auto told = told_->find(name(DEVLINK_ATTR_BUS_NAME) + "/" + name(DEVLINK_ATTR_DEV_NAME));
    if (told == told_->end()) {
      return errorMessage(sequence, ENODEV);
    }
    if (told->second.error != 0) {
      return errorMessage(sequence, told->second.error);
    }
    return message(devlinkFamily, sequence,
                   generic(DEVLINK_CMD_INFO_GET) + devlinkAttributes(told->second.lines));
  }

  std::shared_ptr<const std::map<std::string, DevlinkTold>> told_;
  std::deque<std::string> answers_;
};

}  // namespace

std::string bytesOfHex(std::string_view hex) {
  std::string digits;
  std::copy_if(hex.begin(), hex.end(), std::back_inserter(digits),
               [](char c) { return c != ' ' && c != '\n'; });
  std::string bytes;
  for (std::size_t i = 0; i + 1 < digits.size(); i += 2) {
    bytes.push_back(static_cast<char>(std::stoi(digits.substr(i, 2), nullptr, 16)));
  }
  return bytes;
}

std::string number32(std::uint32_t number) {
  return raw(number);
}

std::string attribute(std::uint16_t type, std::string_view value) {
  return padded(raw(static_cast<std::uint16_t>(value.size() + 4)) + raw(type) + std::string(value));
}

std::string message(std::uint16_t type, std::uint32_t sequence, std::string_view payload) {
  return padded(number32(static_cast<std::uint32_t>(payload.size() + 16)) + raw(type) +
                raw(std::uint16_t{0}) + number32(sequence) + number32(0) + std::string(payload));
}

std::string errorMessage(std::uint32_t sequence, int error) {
  return message(NLMSG_ERROR, sequence, raw(std::int32_t{-error}) + std::string(16, '\0'));
}

std::string generic(std::uint8_t command) {
  return raw(command) + std::string(3, '\1');
}

std::string devlinkAttributes(std::string_view lines) {
  static const std::map<std::string_view, std::uint16_t> kinds{
      {"fixed", DEVLINK_ATTR_INFO_VERSION_FIXED},
      {"running", DEVLINK_ATTR_INFO_VERSION_RUNNING},
      {"stored", DEVLINK_ATTR_INFO_VERSION_STORED},
  };
  std::string attributes = text(DEVLINK_ATTR_INFO_DRIVER_NAME, "some");
  while (!lines.empty()) {
    const std::string_view line = lines.substr(0, lines.find(';'));
    const std::size_t blank = line.find(' ');
    const std::size_t equals = line.find('=');
    if (blank == std::string_view::npos || equals == std::string_view::npos || equals < blank) {
      throw std::invalid_argument("no line of devlink: " + std::string(line));
    }
    attributes += attribute(static_cast<std::uint16_t>(kinds.at(line.substr(0, blank)) | NLA_F_NESTED),
                            text(DEVLINK_ATTR_INFO_VERSION_NAME, line.substr(blank + 1, equals - blank - 1)) +
                                text(DEVLINK_ATTR_INFO_VERSION_VALUE, line.substr(equals + 1)));
    lines.remove_prefix(std::min(line.size() + 1, lines.size()));
  }
  return attributes;
}

std::string familyAnswer(std::uint32_t sequence) {
  return message(GENL_ID_CTRL, sequence,
                 generic(CTRL_CMD_NEWFAMILY) + text(CTRL_ATTR_FAMILY_NAME, "devlink") +
                     attribute(CTRL_ATTR_FAMILY_ID, raw(devlinkFamily)));
}

NetlinkOpener devlinkTelling(std::map<std::string, DevlinkTold> told) {
  return [told = std::make_shared<const std::map<std::string, DevlinkTold>>(std::move(told))] {
    return OpenedNetlink{std::make_unique<FakeKernel>(told), 0};
  };
}

int ScriptedNetlink::send(std::string_view request) {
  script_->requests.emplace_back(request);
  return script_->sendError;
}

int ScriptedNetlink::await(std::chrono::milliseconds /*limit*/) {
  ++script_->awaited;
  return script_->answers.empty() ? ETIMEDOUT : 0;
}

NetlinkChannel::Received ScriptedNetlink::receive() {
  Received received = script_->answers.front();
  script_->answers.pop_front();
  return received;
}

}  // namespace agent::discovery::test
