#include <cimom/Names.h>
#include <cimom/broker/NumberText.h>
#include <cimom/xml/Conversion.h>
#include <cimom/xml/Types.h>

#include <charconv>
#include <cstddef>
#include <cstdint>

namespace cimom::xml {

namespace {

constexpr std::string_view blanks = " \t\r\n";

std::string_view trimmed(std::string_view text) {
  const std::size_t first = text.find_first_not_of(blanks);
  if (first == std::string_view::npos)
    return {};
  return text.substr(first, text.find_last_not_of(blanks) - first + 1);
}

// A sign, then digits: hexadecimal after 0x, binary before b, else decimal.
std::optional<Integer> readInteger(std::string_view text) {
  const bool isNegative = text.starts_with('-');
  if (isNegative || text.starts_with('+'))
    text.remove_prefix(1);
  int base = 10;
  if (text.starts_with("0x") || text.starts_with("0X")) {
    base = 16;
    text.remove_prefix(2);
  } else if (text.ends_with('b') || text.ends_with('B')) {
    base = 2;
    text.remove_suffix(1);
  }
  std::uint64_t magnitude = 0;
  const auto result = std::from_chars(text.data(), text.data() + text.size(), magnitude, base);
  if (text.empty() || result.ec != std::errc() || result.ptr != text.data() + text.size())
    return std::nullopt;
  constexpr std::uint64_t lowest = std::uint64_t{1} << 63U;
  if (isNegative && magnitude > lowest)
    return std::nullopt;
  return Integer{isNegative && magnitude != 0, isNegative ? 0 - magnitude : magnitude};
}

// The one character of a text in UTF-8, which XML's reader has checked.
std::optional<CMPIChar16> readCharacter(std::string_view text) {
  const auto byte = [&](std::size_t index) {
    return static_cast<unsigned>(static_cast<unsigned char>(text[index]));
  };
  unsigned code = 0;
  if (text.size() == 1 && byte(0) < 0x80)
    code = byte(0);
  else if (text.size() == 2 && byte(0) >= 0xc2 && byte(0) < 0xe0)
    code = ((byte(0) & 0x1fU) << 6U) | (byte(1) & 0x3fU);
  else if (text.size() == 3 && byte(0) >= 0xe0 && byte(0) < 0xf0)
    code = ((byte(0) & 0xfU) << 12U) | ((byte(1) & 0x3fU) << 6U) | (byte(2) & 0x3fU);
  else
    return std::nullopt;
  return static_cast<CMPIChar16>(code);
}

bool readNumber(std::string_view text, CMPIType type, CMPIData& data) {
  if (type == CMPI_real32 || type == CMPI_real64)
    return readReal(text, type, data);
  const auto number = readInteger(text);
  if (!number || !fitsType(*number, type))
    return false;
  data = integerData(*number, type);
  return true;
}

bool readText(Arena& arena, CMPIType type, std::string_view text, CMPIData& data) {
  data = {};
  data.type = type;
  switch (type) {
    case CMPI_string:
      data.value.string = String::create(arena, text);
      return true;
    case CMPI_boolean: {
      const auto flag = booleanOf(text);
      data.value.boolean = flag.value_or(false) ? 1 : 0;
      return flag.has_value();
    }
    case CMPI_char16: {
      const auto character = readCharacter(text);
      data.value.char16 = character.value_or(0);
      return character.has_value();
    }
    case CMPI_dateTime:
      data.value.dateTime = DateTime::create(arena, trimmed(text));
      return data.value.dateTime != nullptr;
    default:
      return readNumber(trimmed(text), type, data);
  }
}

}  // namespace

CMPIData makeValue(Arena& arena, CMPIType type, const ValueText& text) {
  if (!text)
    return nullData(type);
  CMPIData data{};
  if (readText(arena, type, *text, data))
    return data;
  constexpr std::size_t shown = 64;
  throw ConversionError(CMPI_RC_ERR_INVALID_PARAMETER,
                        "\"" + text->substr(0, shown) + "\" is no " + std::string(typeName(type)));
}

CMPIData makeArray(Arena& arena, CMPIType simpleType, const std::vector<ValueText>& texts) {
  Array* const array = Array::create(arena, texts.size(), simpleType);
  if (array == nullptr)
    throw ConversionError(CMPI_RC_ERR_INVALID_PARAMETER, "an array cannot hold these elements");
  for (std::size_t index = 0; index < texts.size(); ++index) {
    const CMPIData element = makeValue(arena, simpleType, texts[index]);
    if (!isNull(element))
      (void)array->set(index, &element.value, element.type);  // of the array's own type: it takes it
  }
  CMPIData data{};
  data.type = static_cast<CMPIType>(simpleType | CMPI_ARRAY);
  data.value.array = array;
  return data;
}

std::optional<bool> booleanOf(std::string_view text) {
  const std::string_view word = trimmed(text);
  if (sameName(word, "true"))
    return true;
  return sameName(word, "false") ? std::optional(false) : std::nullopt;
}

std::optional<CMPIUint32> uint32Of(std::string_view text) {
  const auto number = readInteger(trimmed(text));
  if (!number || !fitsType(*number, CMPI_uint32))
    return std::nullopt;
  return static_cast<CMPIUint32>(number->bits);
}

}  // namespace cimom::xml
