// Any object of the broker as text, for logs and for CMPI's `toString`.
#pragma once

#include <cmpi/cmpidt.h>

#include <string>
#include <string_view>

namespace cimom {

/// The CMPI type name of the object behind a handle ("CMPIInstance"); empty for what is none of the broker's
/// objects. `object` points to any CMPI object: a handle and its function table.
[[nodiscard]] std::string_view typeNameOf(const void* object);

/// A string's text, a datetime's, a path's WBEM URI; instances and arrays as in MOF. Empty for what is none
/// of these.
[[nodiscard]] std::string describe(const void* object);

/// A value as MOF would write it; nulls as "NULL".
[[nodiscard]] std::string describe(const CMPIData& data);

}  // namespace cimom
