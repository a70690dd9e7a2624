// The name and password of HTTP's Basic scheme (RFC 7617).
#pragma once

#include <optional>
#include <string>
#include <string_view>

namespace cimom::http {

struct BasicLogin {
  std::string user;
  std::string password;
};

/// Reads the value of an Authorization header. Nothing: another scheme, bad base64, no colon, or a NUL in it.
[[nodiscard]] std::optional<BasicLogin> parseBasicLogin(std::string_view header);

/// Text from outside for a line of the log: control characters and bytes beyond ASCII as \xNN, and not more
/// than some 60 characters of it.
[[nodiscard]] std::string printable(std::string_view text);

}  // namespace cimom::http
