// Numbers as MOF writes them.
#pragma once

#include <cimom/mof/Declarations.h>

#include <optional>
#include <string_view>

namespace cimom::mof {

/// Reads a whole text as a number: decimal, octal (0..), hexadecimal (0x..), binary (..b) or real (digits
/// around a point, perhaps with an exponent). Nothing where it is none, or does not fit 64 bits.
[[nodiscard]] std::optional<Scalar> parseNumber(std::string_view text);

/// The value as one of `type` has it: integers in the type's range, an integer for a real, and so on.
/// Nothing where it does not fit. NULL fits every type.
[[nodiscard]] std::optional<Scalar> fitted(const Scalar& value, CMPIType type);

}  // namespace cimom::mof
