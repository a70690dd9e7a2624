// The names that CIM-XML has for CIM's types.
#pragma once

#include <cmpi/cmpidt.h>

#include <string_view>

namespace cimom::xml {

/// "uint8", "string", "datetime", "reference"; of an array, the name of its elements' type. "string" for an
/// instance: an embedded one is text. Empty for what is no type of a value.
[[nodiscard]] std::string_view typeName(CMPIType type);

/// CMPI_null for a name that is none. Names of types are the document type's: their case counts.
[[nodiscard]] CMPIType typeOf(std::string_view name);

}  // namespace cimom::xml
