// A single value of an inventory file, as the reader meets it.
#pragma once

#include <agent/framework/NodeTree.h>

#include <cstdint>
#include <string>
#include <string_view>

namespace agent::inventory {

/// A JSON value that is neither object nor array.
struct Scalar {
  enum class Kind { Null, Bool, Number, OtherNumber, Text };
  Kind kind = Kind::Null;
  std::uint64_t number = 0;  ///< where the kind is Number: an integer from 0 on
  std::string_view text;     ///< where the kind is Text
};

/// The value as a message shows it; a long text is cut.
inline std::string shown(const Scalar& value) {
  constexpr std::size_t longest = 40;
  switch (value.kind) {
    case Scalar::Kind::Null:
      return "null";
    case Scalar::Kind::Bool:
      return "a boolean";
    case Scalar::Kind::Number:
      return std::to_string(value.number);
    case Scalar::Kind::OtherNumber:
      return "a number that is negative, has a fraction or is too big";
    case Scalar::Kind::Text:
      break;
  }
  const bool isLong = value.text.size() > longest;
  return '"' + cleanText(value.text.substr(0, longest)) + (isLong ? "...\"" : "\"");
}

/// The path of a field as a message shows it: the middle of a long one is cut, between two names where they
/// are not too long themselves.
std::string shownPath(std::string_view path);

}  // namespace agent::inventory
