#include <agent/discovery/network/Netlink.h>

#include <linux/genetlink.h>
#include <linux/netlink.h>

#include <algorithm>
#include <cerrno>
#include <cstddef>
#include <cstring>
#include <type_traits>

namespace agent::discovery::netlink {

namespace {

constexpr std::size_t headerSize = NLMSG_HDRLEN;
constexpr std::size_t attributeHeaderSize = NLA_HDRLEN;
constexpr std::size_t longestText = 65530;

constexpr std::size_t aligned(std::size_t length) {
  return (length + NLMSG_ALIGNTO - 1) & ~std::size_t{NLMSG_ALIGNTO - 1};
}

/// The number at `offset`; the bytes must hold it.
template <typename Number>
Number numberAt(std::string_view bytes, std::size_t offset) {
  static_assert(std::is_integral_v<Number>);
  Number number = 0;
  std::memcpy(&number, bytes.substr(offset, sizeof number).data(), sizeof number);
  return number;
}

template <typename Number>
void append(std::string& bytes, Number number) {
  static_assert(std::is_integral_v<Number>);
  bytes.append(reinterpret_cast<const char*>(&number), sizeof number);
}

void take(std::string_view& bytes, std::size_t length) {
  bytes.remove_prefix(std::min(aligned(length), bytes.size()));
}

}  // namespace

std::optional<Message> takeMessage(std::string_view& bytes) {
  if (bytes.size() < headerSize) {
    return std::nullopt;
  }
  const auto length = numberAt<std::uint32_t>(bytes, offsetof(nlmsghdr, nlmsg_len));
  if (length < headerSize || length > bytes.size()) {
    return std::nullopt;
  }
  const Message message{numberAt<std::uint16_t>(bytes, offsetof(nlmsghdr, nlmsg_type)),
                        numberAt<std::uint32_t>(bytes, offsetof(nlmsghdr, nlmsg_seq)),
                        bytes.substr(headerSize, length - headerSize)};
  take(bytes, length);
  return message;
}

int errorOf(std::string_view payload) {
  if (payload.size() < sizeof(std::int32_t)) {
    return EBADMSG;
  }
  const auto negative = numberAt<std::int32_t>(payload, offsetof(nlmsgerr, error));
  constexpr std::int32_t highestError = 4095;
  return negative <= 0 && negative >= -highestError ? -negative : EBADMSG;
}

std::optional<GenericMessage> parseGeneric(std::string_view payload) {
  if (payload.size() < GENL_HDRLEN) {
    return std::nullopt;
  }
  return GenericMessage{numberAt<std::uint8_t>(payload, offsetof(genlmsghdr, cmd)),
                        payload.substr(GENL_HDRLEN)};
}

std::optional<Attribute> takeAttribute(std::string_view& attributes) {
  if (attributes.size() < attributeHeaderSize) {
    return std::nullopt;
  }
  const auto length = numberAt<std::uint16_t>(attributes, offsetof(nlattr, nla_len));
  if (length < attributeHeaderSize || length > attributes.size()) {
    return std::nullopt;
  }
  const auto type = numberAt<std::uint16_t>(attributes, offsetof(nlattr, nla_type));
  const Attribute attribute{static_cast<std::uint16_t>(type & NLA_TYPE_MASK),
                            attributes.substr(attributeHeaderSize, length - attributeHeaderSize)};
  take(attributes, length);
  return attribute;
}

std::optional<std::string_view> findAttribute(std::string_view attributes, std::uint16_t type) {
  while (const std::optional<Attribute> attribute = takeAttribute(attributes)) {
    if (attribute->type == type) {
      return attribute->value;
    }
  }
  return std::nullopt;
}

std::string_view textOf(std::string_view value) {
  return value.substr(0, value.find('\0'));
}

std::optional<std::uint16_t> number16(std::string_view value) {
  return value.size() == sizeof(std::uint16_t) ? std::optional(numberAt<std::uint16_t>(value, 0))
                                               : std::nullopt;
}

Request::Request(std::uint16_t type, std::uint32_t sequence, std::uint8_t command) {
  append(bytes_, std::uint32_t{headerSize + GENL_HDRLEN});
  append(bytes_, type);
  append(bytes_, std::uint16_t{NLM_F_REQUEST});
  append(bytes_, sequence);
  append(bytes_, std::uint32_t{0});  // the kernel knows whose socket it is
  append(bytes_, command);
  append(bytes_, std::uint8_t{1});  // the version of the protocol
  append(bytes_, std::uint16_t{0});
}

Request& Request::addText(std::uint16_t type, std::string_view text) {
  text = text.substr(0, longestText);
  append(bytes_, static_cast<std::uint16_t>(attributeHeaderSize + text.size() + 1));
  append(bytes_, type);
  bytes_.append(text);
  bytes_.push_back('\0');
  bytes_.resize(aligned(bytes_.size()), '\0');
  const auto length = static_cast<std::uint32_t>(bytes_.size());
  std::memcpy(bytes_.data(), &length, sizeof length);
  return *this;
}

}  // namespace agent::discovery::netlink
