#include <cimom/broker/NumberText.h>

#include <cimom/Names.h>

#include <charconv>
#include <limits>
#include <optional>

namespace cimom {

namespace {

bool isDigit(char character) {
  return character >= '0' && character <= '9';
}

template <class Number>
std::optional<Number> wholeNumber(std::string_view text) {
  if (text.size() > 1 && text[0] == '+' && text[1] != '-') {
    text.remove_prefix(1);
  }
  Number number{};
  const auto result = std::from_chars(text.data(), text.data() + text.size(), number);
  const bool isWhole = result.ec == std::errc() && result.ptr == text.data() + text.size();
  return isWhole && !text.empty() ? std::optional(number) : std::nullopt;
}

// Gives a key the integer type that its class declares, where the number fits it.
template <class Type>
bool fits(Integer number) {
  if (number.isNegative) {
    return std::numeric_limits<Type>::is_signed &&
           static_cast<std::int64_t>(number.bits) >=
               static_cast<std::int64_t>(std::numeric_limits<Type>::min());
  }
  return number.bits <= static_cast<std::uint64_t>(std::numeric_limits<Type>::max());
}

}  // namespace

bool fitsType(Integer number, CMPIType type) {
  switch (type) {
    case CMPI_uint8:
      return fits<CMPIUint8>(number);
    case CMPI_uint16:
      return fits<CMPIUint16>(number);
    case CMPI_uint32:
      return fits<CMPIUint32>(number);
    case CMPI_uint64:
      return fits<CMPIUint64>(number);
    case CMPI_sint8:
      return fits<CMPISint8>(number);
    case CMPI_sint16:
      return fits<CMPISint16>(number);
    case CMPI_sint32:
      return fits<CMPISint32>(number);
    case CMPI_sint64:
      return fits<CMPISint64>(number);
    default:
      return false;
  }
}

CMPIData integerData(Integer number, CMPIType type) {
  CMPIData data{};
  data.type = type;
  data.value.uint64 = number.bits;  // the narrower members are its low bytes
  return data;
}

bool readReal(std::string_view word, CMPIType type, CMPIData& data) {
  data.type = type;
  if (type == CMPI_real32) {
    const auto number = wholeNumber<float>(word);
    data.value.real32 = number.value_or(0);
    return number.has_value();
  }
  const auto number = wholeNumber<double>(word);
  data.value.real64 = number.value_or(0);
  return number.has_value();
}

bool readKeyNumber(std::string_view word, CMPIType declared, CMPIData& data) {
  const bool isReal = declared == CMPI_real32 || declared == CMPI_real64;
  const auto signedNumber = wholeNumber<std::int64_t>(word);
  const auto unsignedNumber = wholeNumber<std::uint64_t>(word);
  if (!isReal && (signedNumber || unsignedNumber)) {
    const bool isNegative = signedNumber && *signedNumber < 0;
    const Integer number{isNegative,
                         isNegative ? static_cast<std::uint64_t>(*signedNumber) : *unsignedNumber};
    const CMPIType widest = signedNumber ? CMPI_sint64 : CMPI_uint64;
    data = integerData(number, fitsType(number, declared) ? declared : widest);
    return true;
  }
  const bool isInteger = word.find_first_not_of("+-0123456789") == std::string_view::npos;
  const bool startsAsNumber = !word.empty() && (isDigit(word[0]) || word.find_first_of(".+-") == 0 ||
                                                sameName(word, "inf") || sameName(word, "nan"));
  if (!startsAsNumber || (isInteger && !isReal)) {
    return false;
  }
  return readReal(word, isReal ? declared : CMPI_real64, data);
}

}  // namespace cimom
