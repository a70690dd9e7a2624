// Letters without case, whatever the locale of the process.
#pragma once

namespace agent {

/// The lower-case form of an ASCII letter; any other character as it is.
constexpr char lower(char c) {
  return c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c;
}

}  // namespace agent
