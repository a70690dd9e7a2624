// How values get into the broker's objects: checked, and kept in the object's own arena.
#pragma once

#include <cimom/broker/Arena.h>
#include <cimom/broker/Objects.h>
#include <cmpi/cmpidt.h>

#include <cstdint>
#include <optional>
#include <string_view>

namespace cimom {

/// The type that a value of `type` is kept and shown as: CMPI_chars and CMPI_charsptr are ways to pass a
/// CMPI_string; so for arrays.
[[nodiscard]] constexpr CMPIType keptType(CMPIType type) {
  const auto simple = static_cast<CMPIType>(type & ~CMPI_ARRAY);
  const bool isText = simple == CMPI_chars || simple == CMPI_charsptr;
  return isText ? static_cast<CMPIType>(CMPI_string | (type & CMPI_ARRAY)) : type;
}

/// Whether properties, keys, entries or elements can have this type; arrays excepted.
[[nodiscard]] bool isSimpleType(CMPIType type);

/// Deep copies `value` into `arena` and sets `data`. Null pointers, in place of the value or in it, and the
/// type CMPI_null give a null. CMPI_RC_ERR_INVALID_DATA_TYPE for a type that no value can have,
/// CMPI_RC_ERR_TYPE_MISMATCH for an array of another type than the one said, CMPI_RC_ERR_INVALID_HANDLE for a
/// foreign object; `data` is unchanged then.
CMPIrc makeData(Arena& arena, const CMPIValue* value, CMPIType type, CMPIData& data);

/// The same value in `arena`: immutable objects that already live there are shared, all others copied.
[[nodiscard]] CMPIData copyData(Arena& arena, const CMPIData& data);

[[nodiscard]] CMPIData nullData(CMPIType type);

/// A signed or unsigned integer of any size.
struct Integer {
  bool isNegative;
  std::uint64_t bits;  ///< two's complement where negative
  friend bool operator==(const Integer&, const Integer&) = default;
};
/// None for what is no integer.
[[nodiscard]] std::optional<Integer> integer(const CMPIData& data);

}  // namespace cimom
