// CIM objects out of what a request says, with the types that the schema declares.
//
// Objects are made in the caller's arena and refer to the class table. Names ignore case. Threads: as the
// arena's.
#pragma once

#include <cimom/broker/Arena.h>
#include <cimom/broker/ClassTable.h>
#include <cimom/broker/Objects.h>
#include <cimom/xml/Request.h>
#include <cmpi/cmpidt.h>

#include <optional>
#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

namespace cimom::xml {

/// A value that CIM does not allow there; `what()` names it and says what was expected.
class ConversionError : public std::runtime_error {
 public:
  ConversionError(CMPIrc code, const std::string& message) : std::runtime_error(message), code_(code) {}
  /// CMPI_RC_ERR_INVALID_PARAMETER, CMPI_RC_ERR_NO_SUCH_PROPERTY (the class declares none of this name),
  /// CMPI_RC_ERR_TYPE_MISMATCH (it declares another type), CMPI_RC_ERR_INVALID_CLASS.
  [[nodiscard]] CMPIrc code() const { return code_; }

 private:
  CMPIrc code_;
};

/// How deep references and embedded instances may be nested in each other.
inline constexpr unsigned nestingDepth = 8;

/// The path of an instance or, without keys, of a class; `nameSpace` is for names that carry none. Where the
/// class is known, a key has the type that it declares, as far as the text reads as one; otherwise the type
/// that the client gave, else by VALUETYPE string, boolean, sint64 (uint64, real64 where it takes that). A
/// key without its name is the one key of the class. Unknown keys are kept, for the object manager to refuse.
/// Throws `ConversionError`: a key given twice, a nameless one of a class that has not exactly one, a number
/// that is none, nesting too deep.
ObjectPath* makePath(Arena& arena, const ClassTable& classes, const ObjectName& name,
                     std::string_view nameSpace);

/// An instance of the element's class with its properties, nulls included. Its path has `nameSpace` and the
/// keys: those of the element's own name where it has one, else those set as properties. Throws
/// `ConversionError`.
Instance* makeInstance(Arena& arena, const ClassTable& classes, const InstanceElement& element,
                       std::string_view nameSpace);

/// A single value of a simple type, or null. Integers are decimal, hexadecimal (0x) or binary (..b) and must
/// be in the type's range; booleans true or false in any case; reals decimal, or NaN, INF, -INF; a char16 one
/// character of the basic plane. White space around anything but strings and characters means nothing.
/// Throws `ConversionError`.
[[nodiscard]] CMPIData makeValue(Arena& arena, CMPIType type, const ValueText& text);

/// An array of a simple type.
[[nodiscard]] CMPIData makeArray(Arena& arena, CMPIType simpleType, const std::vector<ValueText>& texts);

/// The boolean parameters of operations: true or false in any case; none for anything else.
[[nodiscard]] std::optional<bool> booleanOf(std::string_view text);
/// The integer parameters: as `makeValue` reads a uint32.
[[nodiscard]] std::optional<CMPIUint32> uint32Of(std::string_view text);

}  // namespace cimom::xml
