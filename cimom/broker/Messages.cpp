#include <cimom/broker/Messages.h>
#include <cimom/broker/Objects.h>

#include <string_view>
#include <vector>

namespace cimom {

namespace {

std::string textOf(const char* chars) {
  return chars == nullptr ? "(null)" : chars;
}

std::string textOf(const CMPIString* handle) {
  const String* const string = String::from(handle);
  return string == nullptr ? "(null)" : std::string(string->view());
}

// Ends at a type whose value cannot be skipped.
std::vector<std::string> readInserts(CMPICount count, va_list inserts) {
  constexpr CMPICount most = 10;  // no placeholder names a later one
  std::vector<std::string> texts;
  while (texts.size() < count && texts.size() < most) {
    switch (va_arg(inserts, int)) {
      case CMPI_boolean:
        texts.emplace_back(va_arg(inserts, int) != 0 ? "true" : "false");
        break;
      case CMPI_uint8:
      case CMPI_uint16:
      case CMPI_char16:
      case CMPI_sint8:
      case CMPI_sint16:
      case CMPI_sint32:
        texts.push_back(std::to_string(va_arg(inserts, int)));
        break;
      case CMPI_uint32:
        texts.push_back(std::to_string(va_arg(inserts, unsigned int)));
        break;
      case CMPI_uint64:
        texts.push_back(std::to_string(va_arg(inserts, CMPIUint64)));
        break;
      case CMPI_sint64:
        texts.push_back(std::to_string(va_arg(inserts, CMPISint64)));
        break;
      case CMPI_real32:
      case CMPI_real64:
        texts.push_back(std::to_string(va_arg(inserts, double)));
        break;
      case CMPI_chars:
        texts.push_back(textOf(va_arg(inserts, const char*)));
        break;
      case CMPI_string:
        texts.push_back(textOf(va_arg(inserts, const CMPIString*)));
        break;
      default:
        return texts;
    }
  }
  return texts;
}

}  // namespace

std::string formatMessage(const char* text, CMPICount count, va_list inserts) {
  const std::vector<std::string> texts = readInserts(count, inserts);
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
