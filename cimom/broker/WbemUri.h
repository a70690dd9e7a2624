// Object paths as text: WBEM URIs (DSP0207), and what people type for them.
//
//   //host/root/cimv2:Class.Key="text",Number=5,Flag=true    root/cimv2:Class.Key="text"    Class.Key="text"
//
// In quotes, a backslash stands before a quote or a backslash. A reference is its own text in quotes, a
// datetime its text in quotes, an integer decimal, a real with a point or an exponent, a boolean true or
// false, a char16 in single quotes. Where `classes` knows the class, a key has the type that the class
// declares, otherwise string, sint64 (uint64 where it takes that), real64 or boolean.
#pragma once

#include <cimom/broker/Arena.h>
#include <cimom/broker/ClassTable.h>
#include <cimom/broker/Objects.h>

#include <cstddef>
#include <stdexcept>
#include <string>
#include <string_view>

namespace cimom {

/// How deep references may be nested in each other.
inline constexpr unsigned wbemUriDepth = 8;

/// What is wrong with a text: `what()` names the column (the first is 1) and what was expected there.
class WbemUriError : public std::runtime_error {
 public:
  WbemUriError(std::size_t column, const std::string& message);
  [[nodiscard]] std::size_t column() const { return column_; }

 private:
  std::size_t column_;
};

/// With host and namespace where the path has them; keys in their order. `parseWbemUri` gives the same path.
/// References nested `wbemUriDepth` deep lose their keys.
[[nodiscard]] std::string formatWbemUri(const ObjectPath& path);

/// A path in `arena`. `defaultNameSpace` is for texts without one. Throws `WbemUriError`; also for text
/// beyond 64 KiB and for references nested deeper than `wbemUriDepth`.
ObjectPath* parseWbemUri(Arena& arena, const ClassTable& classes, std::string_view text,
                         std::string_view defaultNameSpace = {});

}  // namespace cimom
