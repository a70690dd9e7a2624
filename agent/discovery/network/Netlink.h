// Netlink messages as bytes: how requests are written and answers are read. Knows no socket.
//
// All numbers stand in the byte order of the machine. Readers take what they read off the bytes they are
// given; what they hand out lasts as long as these.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

namespace agent::discovery::netlink {

/// A message, without its header.
struct Message {
  std::uint16_t type = 0;      ///< of the protocol, or an NLMSG_ number
  std::uint32_t sequence = 0;  ///< the request's that it answers
  std::string_view payload;
};

/// Nothing where there is none any more, or where what is left is no whole message.
std::optional<Message> takeMessage(std::string_view& bytes);

/// Of an NLMSG_ERROR: the errno value; 0 where it only acknowledges; EBADMSG where it is too short.
int errorOf(std::string_view payload);

/// What a message of generic netlink holds.
struct GenericMessage {
  std::uint8_t command = 0;
  std::string_view attributes;
};

/// Nothing where the payload is too short.
std::optional<GenericMessage> parseGeneric(std::string_view payload);

struct Attribute {
  std::uint16_t type = 0;  ///< without its flags
  std::string_view value;  ///< of a nested attribute: attributes
};

/// Nothing where there is none any more, or where what is left is no whole attribute.
std::optional<Attribute> takeAttribute(std::string_view& attributes);

/// The value of the first attribute of that type.
std::optional<std::string_view> findAttribute(std::string_view attributes, std::uint16_t type);

/// An attribute's text: what stands before the first zero byte, if there is one.
std::string_view textOf(std::string_view value);

/// A number of 16 bits; nothing where the value has not exactly as many.
std::optional<std::uint16_t> number16(std::string_view value);

/// Writes a request of generic netlink.
class Request {
 public:
  Request(std::uint16_t type, std::uint32_t sequence, std::uint8_t command);

  /// Adds an attribute with a text, at most 65530 bytes of it.
  Request& addText(std::uint16_t type, std::string_view text);

  [[nodiscard]] const std::string& bytes() const { return bytes_; }

 private:
  std::string bytes_;
};

}  // namespace agent::discovery::netlink
