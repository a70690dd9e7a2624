// Values as the text of VALUE and KEYVALUE.
#pragma once

#include <cimom/mof/Declarations.h>
#include <cmpi/cmpidt.h>

#include <string>
#include <string_view>

namespace cimom::xml {

/// The text of a value of a simple type that is not null, without tags: TRUE or FALSE, decimal integers,
/// reals with as many digits as give the same number again (9 or 17) or INF, -INF, NaN, a char16 as its
/// character, a datetime's 25 characters. Nothing for references and instances, which are no text.
void appendValueText(std::string& out, const CMPIData& data);

/// VALUE.ARRAY of an array of such values, VALUE.NULL for its nulls.
void appendValueArray(std::string& out, const CMPIData& array);

/// VALUE or VALUE.ARRAY of what MOF declares, as `type` is written; nothing for NULL.
void appendMofValue(std::string& out, const mof::Value& value, CMPIType type);

/// Appends ` NAME="text"`.
void appendAttribute(std::string& out, std::string_view name, std::string_view text);

}  // namespace cimom::xml
