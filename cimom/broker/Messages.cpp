#include <cimom/broker/Messages.h>
#include <cimom/broker/Objects.h>

#include <optional>
#include <string_view>
#include <vector>

namespace cimom {

namespace {

std::optional<std::string> readNumber(CMPIType type, va_list* inserts) {
  switch (type) {
    case CMPI_boolean:
      return va_arg(*inserts, int) != 0 ? "true" : "false";
    case CMPI_uint8:
    case CMPI_uint16:
    case CMPI_char16:
    case CMPI_sint8:
    case CMPI_sint16:
    case CMPI_sint32:
      return std::to_string(va_arg(*inserts, int));
    case CMPI_uint32:
      return std::to_string(va_arg(*inserts, unsigned int));
    case CMPI_uint64:
      return std::to_string(va_arg(*inserts, CMPIUint64));
    case CMPI_sint64:
      return std::to_string(va_arg(*inserts, CMPISint64));
    case CMPI_real32:
    case CMPI_real64:
      return std::to_string(va_arg(*inserts, double));
    default:
      return std::nullopt;
  }
}

std::optional<std::string> readInsert(va_list* inserts) {
  const auto type = static_cast<CMPIType>(va_arg(*inserts, int));
  if (type == CMPI_chars) {
    const char* const chars = va_arg(*inserts, const char*);
    return chars == nullptr ? "(null)" : chars;
  }
  if (type == CMPI_string) {
    const String* const string = String::from(va_arg(*inserts, const CMPIString*));
    return string == nullptr ? "(null)" : std::string(string->view());
  }
  return readNumber(type, inserts);
}

std::vector<std::string> readInserts(CMPICount count, va_list* inserts) {
  constexpr CMPICount most = 10;  // no placeholder names a later one
  std::vector<std::string> texts;
  while (texts.size() < count && texts.size() < most) {
    auto insert = readInsert(inserts);
    if (!insert) {
      break;
    }
    texts.push_back(std::move(*insert));
  }
  return texts;
}

}  // namespace

std::string formatMessage(const char* text, CMPICount count, va_list inserts) {
  va_list reading;
  va_copy(reading, inserts);
  const std::vector<std::string> texts = readInserts(count, &reading);
  va_end(reading);
  const std::string_view pattern = text == nullptr ? std::string_view() : text;
  std::string out;
  for (std::size_t position = 0; position < pattern.size(); ++position) {
    const std::size_t next = position + 1;
    const bool isPlaceholder =
        pattern[position] == '$' && next < pattern.size() && pattern[next] >= '0' && pattern[next] <= '9';
    const std::size_t index = isPlaceholder ? static_cast<std::size_t>(pattern[next] - '0') : texts.size();
    if (index < texts.size()) {
      out += texts[index];
      position = next;
    } else {
      out += pattern[position];
    }
  }
  return out;
}

}  // namespace cimom
