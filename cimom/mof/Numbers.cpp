#include <cimom/Names.h>
#include <cimom/mof/Numbers.h>

#include <charconv>
#include <limits>
#include <string>

namespace cimom::mof {

namespace {

std::optional<double> parseReal(std::string_view text) {
  // from_chars takes no plus sign, and unlike strtod it knows no locale.
  if (text.starts_with('+'))
    text.remove_prefix(1);
  const bool lastIsDigit = !text.empty() && text.back() >= '0' && text.back() <= '9';
  double value = 0;
  const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), value);
  if (error != std::errc() || end != text.data() + text.size() || !lastIsDigit)
    return std::nullopt;
  return value;
}

int takeBase(std::string_view& digits) {
  if (digits.size() > 2 && digits.front() == '0' && foldCase(digits[1]) == 'x') {
    digits.remove_prefix(2);
    return 16;
  }
  if (digits.size() > 1 && foldCase(digits.back()) == 'b') {
    digits.remove_suffix(1);
    return 2;
  }
  return digits.size() > 1 && digits.front() == '0' ? 8 : 10;
}

template <typename Number>
std::optional<Scalar> integerWithin(const Scalar& value) {
  using Limits = std::numeric_limits<Number>;
  if (const auto* number = std::get_if<std::int64_t>(&value)) {
    if (std::in_range<Number>(*number))
      return value;
  } else if (const auto* large = std::get_if<std::uint64_t>(&value)) {
    if (*large <= static_cast<std::uint64_t>(Limits::max()))
      return value;
  }
  return std::nullopt;
}

std::optional<Scalar> fittedReal(const Scalar& value) {
  if (std::holds_alternative<double>(value))
    return value;
  if (const auto* number = std::get_if<std::int64_t>(&value))
    return static_cast<double>(*number);
  if (const auto* large = std::get_if<std::uint64_t>(&value))
    return static_cast<double>(*large);
  return std::nullopt;
}

template <typename Held>
std::optional<Scalar> only(const Scalar& value) {
  return std::holds_alternative<Held>(value) ? std::optional<Scalar>(value) : std::nullopt;
}

}  // namespace

std::optional<Scalar> parseNumber(std::string_view text) {
  if (text.find('.') != std::string_view::npos) {
    const auto real = parseReal(text);
    return real ? std::optional<Scalar>(*real) : std::nullopt;
  }
  const bool negative = text.starts_with('-');
  if (negative || text.starts_with('+'))
    text.remove_prefix(1);
  const int base = takeBase(text);
  std::uint64_t magnitude = 0;
  const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), magnitude, base);
  if (text.empty() || error != std::errc() || end != text.data() + text.size())
    return std::nullopt;
  constexpr auto largest = static_cast<std::uint64_t>(std::numeric_limits<std::int64_t>::max());
  if (!negative) {
    if (magnitude <= largest)
      return static_cast<std::int64_t>(magnitude);
    return magnitude;
  }
  if (magnitude > largest + 1)
    return std::nullopt;
  return static_cast<std::int64_t>(~magnitude + 1);
}

std::optional<Scalar> fitted(const Scalar& value, CMPIType type) {
  if (std::holds_alternative<std::monostate>(value))
    return value;
  switch (type) {
    case CMPI_uint8:
      return integerWithin<std::uint8_t>(value);
    case CMPI_uint16:
      return integerWithin<std::uint16_t>(value);
    case CMPI_uint32:
      return integerWithin<std::uint32_t>(value);
    case CMPI_uint64:
      return integerWithin<std::uint64_t>(value);
    case CMPI_sint8:
      return integerWithin<std::int8_t>(value);
    case CMPI_sint16:
      return integerWithin<std::int16_t>(value);
    case CMPI_sint32:
      return integerWithin<std::int32_t>(value);
    case CMPI_sint64:
      return integerWithin<std::int64_t>(value);
    case CMPI_real32:
    case CMPI_real64:
      return fittedReal(value);
    case CMPI_boolean:
      return only<bool>(value);
    case CMPI_char16:
      return only<CMPIChar16>(value);
    default:
      return only<std::string>(value);
  }
}

}  // namespace cimom::mof
