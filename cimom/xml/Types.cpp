#include <cimom/xml/Types.h>

#include <algorithm>
#include <array>
#include <utility>

namespace cimom::xml {

namespace {

constexpr std::array<std::pair<std::string_view, CMPIType>, 15> types{{
    {"boolean", CMPI_boolean},
    {"string", CMPI_string},
    {"char16", CMPI_char16},
    {"uint8", CMPI_uint8},
    {"sint8", CMPI_sint8},
    {"uint16", CMPI_uint16},
    {"sint16", CMPI_sint16},
    {"uint32", CMPI_uint32},
    {"sint32", CMPI_sint32},
    {"uint64", CMPI_uint64},
    {"sint64", CMPI_sint64},
    {"datetime", CMPI_dateTime},
    {"real32", CMPI_real32},
    {"real64", CMPI_real64},
    {"reference", CMPI_ref},
}};

}  // namespace

std::string_view typeName(CMPIType type) {
  const auto simple = static_cast<CMPIType>(type & ~CMPI_ARRAY);
  if (simple == CMPI_instance)
    return "string";
  const auto* const found =
      std::find_if(types.begin(), types.end(), [simple](const auto& each) { return each.second == simple; });
  return found == types.end() ? std::string_view() : found->first;
}

CMPIType typeOf(std::string_view name) {
  const auto* const found =
      std::find_if(types.begin(), types.end(), [name](const auto& each) { return each.first == name; });
  return found == types.end() ? CMPI_null : found->second;
}

}  // namespace cimom::xml
