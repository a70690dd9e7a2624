// Texts of CMPI's `getMessage`: "$0" to "$9" stand for inserts.
#pragma once

#include <cmpi/cmpidt.h>

#include <cstdarg>
#include <string>

namespace cimom {

/// Reads `count` pairs from `inserts`, each a CMPI type (an int) and a value of that type, promoted as C
/// does: boolean, char16, the integers, the reals, CMPI_chars, CMPI_string. Reading ends at a pair of another
/// type. Empty for a null `text`; a placeholder without an insert stays as it is.
[[nodiscard]] std::string formatMessage(const char* text, CMPICount count, va_list inserts);

}  // namespace cimom
