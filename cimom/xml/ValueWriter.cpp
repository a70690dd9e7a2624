#include <cimom/broker/Objects.h>
#include <cimom/xml/Text.h>
#include <cimom/xml/ValueWriter.h>

#include <array>
#include <charconv>
#include <cmath>
#include <limits>
#include <variant>

namespace cimom::xml {

namespace {

template <class Number>
void appendInteger(std::string& out, Number number) {
  std::array<char, 24> digits{};
  const auto result = std::to_chars(digits.data(), digits.data() + digits.size(), number);
  out.append(digits.data(), static_cast<std::size_t>(result.ptr - digits.data()));
}

// With a point always, as the standard's grammar for reals asks.
template <class Real>
void appendReal(std::string& out, Real number) {
  if (std::isnan(number)) {
    out += "NaN";
    return;
  }
  if (std::isinf(number)) {
    out += number < 0 ? "-INF" : "INF";
    return;
  }
  constexpr int afterPoint = std::numeric_limits<Real>::max_digits10 - 1;
  std::array<char, 40> digits{};
  const auto result = std::to_chars(digits.data(), digits.data() + digits.size(), number,
                                    std::chars_format::scientific, afterPoint);
  out.append(digits.data(), static_cast<std::size_t>(result.ptr - digits.data()));
}

void appendBoolean(std::string& out, bool flag) {
  out += flag ? "TRUE" : "FALSE";
}

void appendMofScalar(std::string& out, const mof::Scalar& scalar, CMPIType type) {
  const auto appendNumber = [&](auto number) {
    if (type == CMPI_real32)
      appendReal(out, static_cast<float>(number));
    else if (type == CMPI_real64)
      appendReal(out, static_cast<double>(number));
    else
      appendInteger(out, number);
  };
  if (const bool* const flag = std::get_if<bool>(&scalar))
    appendBoolean(out, *flag);
  else if (const auto* const signedNumber = std::get_if<std::int64_t>(&scalar))
    appendNumber(*signedNumber);
  else if (const auto* const unsignedNumber = std::get_if<std::uint64_t>(&scalar))
    appendNumber(*unsignedNumber);
  else if (const auto* const real = std::get_if<double>(&scalar))
    type == CMPI_real32 ? appendReal(out, static_cast<float>(*real)) : appendReal(out, *real);
  else if (const auto* const character = std::get_if<CMPIChar16>(&scalar))
    appendCharacter(out, static_cast<char16_t>(*character));
  else if (const auto* const plain = std::get_if<std::string>(&scalar))
    appendText(out, *plain);
}

}  // namespace

void appendValueText(std::string& out, const CMPIData& data) {
  switch (data.type) {
    case CMPI_string:
      return appendText(out, text(data).value_or(std::string_view()));
    case CMPI_dateTime:
      return appendText(out, dateTimeText(data).value_or(std::string_view()));
    case CMPI_boolean:
      return appendBoolean(out, data.value.boolean != 0);
    case CMPI_char16:
      return appendCharacter(out, static_cast<char16_t>(data.value.char16));
    case CMPI_uint8:
      return appendInteger(out, static_cast<unsigned>(data.value.uint8));
    case CMPI_uint16:
      return appendInteger(out, data.value.uint16);
    case CMPI_uint32:
      return appendInteger(out, data.value.uint32);
    case CMPI_uint64:
      return appendInteger(out, data.value.uint64);
    case CMPI_sint8:
      return appendInteger(out, static_cast<int>(data.value.sint8));
    case CMPI_sint16:
      return appendInteger(out, data.value.sint16);
    case CMPI_sint32:
      return appendInteger(out, data.value.sint32);
    case CMPI_sint64:
      return appendInteger(out, data.value.sint64);
    case CMPI_real32:
      return appendReal(out, data.value.real32);
    case CMPI_real64:
      return appendReal(out, data.value.real64);
    default:
      return;
  }
}

void appendValueArray(std::string& out, const CMPIData& array) {
  out += "<VALUE.ARRAY>";
  for (const CMPIData& element : elements(array)) {
    if (isNull(element)) {
      out += "<VALUE.NULL/>";
      continue;
    }
    out += "<VALUE>";
    appendValueText(out, element);
    out += "</VALUE>";
  }
  out += "</VALUE.ARRAY>";
}

void appendMofValue(std::string& out, const mof::Value& value, CMPIType type) {
  if (value.isNull())
    return;
  const auto simple = static_cast<CMPIType>(type & ~CMPI_ARRAY);
  const bool isArray = value.isArray || (type & CMPI_ARRAY) != 0;
  if (isArray)
    out += "<VALUE.ARRAY>";
  for (const mof::Scalar& element : value.elements) {
    if (std::holds_alternative<std::monostate>(element)) {
      out += "<VALUE.NULL/>";
      continue;
    }
    out += "<VALUE>";
    appendMofScalar(out, element, simple);
    out += "</VALUE>";
  }
  if (isArray)
    out += "</VALUE.ARRAY>";
}

void appendAttribute(std::string& out, std::string_view name, std::string_view text) {
  out.append(" ").append(name).append("=\"");
  appendAttributeText(out, text);
  out += '"';
}

}  // namespace cimom::xml
