// Numbers that clients write, as values of CIM's types.
#pragma once

#include <cimom/broker/Values.h>
#include <cmpi/cmpidt.h>

#include <string_view>

namespace cimom {

/// Whether the number is in the range of an integer type; false for any other type.
[[nodiscard]] bool fitsType(Integer number, CMPIType type);

/// The integer as a value of this type, which it must fit.
[[nodiscard]] CMPIData integerData(Integer number, CMPIType type);

/// A key's number: of the declared type where it fits that, otherwise sint64, uint64 where it takes that, or
/// real64 where it is no integer. CMPI_null where nothing is declared. False for what is no number.
[[nodiscard]] bool readKeyNumber(std::string_view word, CMPIType declared, CMPIData& data);

/// A real of type CMPI_real32 or CMPI_real64: decimal, or "nan", "inf" in any case. False for what is none,
/// or does not fit.
[[nodiscard]] bool readReal(std::string_view word, CMPIType type, CMPIData& data);

}  // namespace cimom
