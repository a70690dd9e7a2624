#include <agent/discovery/Values.h>
#include <agent/discovery/network/Devlink.h>
#include <agent/discovery/network/Netlink.h>

#include <linux/devlink.h>
#include <linux/genetlink.h>
#include <linux/netlink.h>

#include <algorithm>
#include <cerrno>
#include <utility>

namespace agent::discovery {

namespace {

constexpr int mostDatagrams = 64;

void add(std::vector<DevlinkVersion>& versions, std::string_view attributes) {
  const auto text = [&](std::uint16_t type) {
    return meaningful(netlink::textOf(netlink::findAttribute(attributes, type).value_or("")));
  };
  std::optional<std::string> name = text(DEVLINK_ATTR_INFO_VERSION_NAME);
  std::optional<std::string> version = text(DEVLINK_ATTR_INFO_VERSION_VALUE);
  const auto isNamed = [&](const DevlinkVersion& known) { return known.name == name; };
  if (name && version && std::none_of(versions.begin(), versions.end(), isNamed)) {
    versions.push_back({std::move(*name), std::move(*version)});
  }
}

/// What `bytes` say in answer to the request: an errno value or attributes. Nothing where they are no answer.
std::optional<std::pair<int, std::string>> answerIn(std::string_view bytes, std::uint16_t type,
                                                    std::uint32_t sequence) {
  while (const std::optional<netlink::Message> message = netlink::takeMessage(bytes)) {
    if (message->sequence != sequence) {
      continue;
    }
    if (message->type == NLMSG_ERROR) {
      if (const int error = netlink::errorOf(message->payload)) {
        return std::pair(error, std::string());
      }
    } else if (message->type == type) {
      const auto generic = netlink::parseGeneric(message->payload);
      return generic ? std::pair(0, std::string(generic->attributes)) : std::pair(EBADMSG, std::string());
    }
  }
  return std::nullopt;
}

}  // namespace

DevlinkInfo parseDevlinkInfo(std::string_view attributes) {
  DevlinkInfo info;
  while (const std::optional<netlink::Attribute> attribute = netlink::takeAttribute(attributes)) {
    switch (attribute->type) {
      case DEVLINK_ATTR_INFO_VERSION_FIXED:
        add(info.fixed, attribute->value);
        break;
      case DEVLINK_ATTR_INFO_VERSION_RUNNING:
        add(info.running, attribute->value);
        info.runningTexts.emplace_back(netlink::textOf(
            netlink::findAttribute(attribute->value, DEVLINK_ATTR_INFO_VERSION_VALUE).value_or("")));
        break;
      case DEVLINK_ATTR_INFO_VERSION_STORED:
        add(info.stored, attribute->value);
        break;
      default:
        break;
    }
  }
  return info;
}

Devlink::Devlink(std::unique_ptr<NetlinkChannel> channel, std::chrono::milliseconds limit)
    : channel_(std::move(channel)), limit_(limit) {}

Devlink::Answer Devlink::info(std::string_view bus, std::string_view device) {
  if (const int error = findFamily()) {
    return {error, {}};
  }
  const std::uint32_t sequence = ++sequence_;
  netlink::Request request(*family_, sequence, DEVLINK_CMD_INFO_GET);
  request.addText(DEVLINK_ATTR_BUS_NAME, bus).addText(DEVLINK_ATTR_DEV_NAME, device);
  const Reply reply = ask(*family_, sequence, request.bytes());
  return reply.error != 0 ? Answer{reply.error, {}} : Answer{0, parseDevlinkInfo(reply.attributes)};
}

int Devlink::findFamily() {
  if (family_) {
    return 0;
  }
  const std::uint32_t sequence = ++sequence_;
  netlink::Request request(GENL_ID_CTRL, sequence, CTRL_CMD_GETFAMILY);
  request.addText(CTRL_ATTR_FAMILY_NAME, DEVLINK_GENL_NAME);
  const Reply reply = ask(GENL_ID_CTRL, sequence, request.bytes());
  if (reply.error != 0) {
    return reply.error;
  }
  family_ = netlink::number16(netlink::findAttribute(reply.attributes, CTRL_ATTR_FAMILY_ID).value_or(""));
  return family_ ? 0 : EBADMSG;
}

Devlink::Reply Devlink::ask(std::uint16_t type, std::uint32_t sequence, const std::string& request) {
  using Clock = std::chrono::steady_clock;
  if (const int error = channel_->send(request)) {
    return {error, {}};
  }
  const Clock::time_point end = Clock::now() + limit_;
  for (int datagrams = 0; datagrams < mostDatagrams; ++datagrams) {
    const auto left = std::chrono::ceil<std::chrono::milliseconds>(end - Clock::now());
    if (const int error = left.count() > 0 ? channel_->await(left) : ETIMEDOUT) {
      return {error, {}};
    }
    const NetlinkChannel::Received received = channel_->receive();
    if (received.error != 0) {
      return {received.error, {}};
    }
    if (auto answer = answerIn(received.bytes, type, sequence)) {
      return {answer->first, std::move(answer->second)};
    }
  }
  return {EBADMSG, {}};
}

}  // namespace agent::discovery
