// An XML document as a tree, within limits. It knows the elements of DSP0203 by name alone.
#pragma once

#include <cimom/xml/Reader.h>

#include <cstddef>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace cimom::xml {

struct Node {
  std::string name;
  std::vector<std::pair<std::string, std::string>> attributes;
  std::string text;  ///< all of the element's own, in one
  std::vector<Node> children;
  std::size_t line = 0;

  /// Null where it is not there.
  [[nodiscard]] const std::string* attribute(std::string_view attributeName) const;
};

/// The root element. Elements that DSP0203 does not know are left out with all that is in them. Throws
/// `RequestError`: "request-not-well-formed", or "request-not-valid" for a document beyond the limits or with
/// declarations of its own.
[[nodiscard]] Node parseDocument(std::string_view body, const Limits& limits);

/// A document whose structure is not what DSP0203 defines: 400, "request-not-loosely-valid".
[[noreturn]] void failStructure(std::size_t line, const std::string& message);

}  // namespace cimom::xml
