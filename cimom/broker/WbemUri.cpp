#include <cimom/broker/Values.h>
#include <cimom/broker/WbemUri.h>

#include <array>
#include <charconv>

namespace cimom {

WbemUriError::WbemUriError(std::size_t column, const std::string& message)
    : std::runtime_error("column " + std::to_string(column) + ": " + message), column_(column) {}

namespace {

void appendPath(std::string& out, const ObjectPath& path, unsigned depth);

void appendQuoted(std::string& out, std::string_view plain) {
  out += '"';
  for (const char character : plain) {
    if (character == '"' || character == '\\') {
      out += '\\';
    }
    out += character;
  }
  out += '"';
}

void appendChar16(std::string& out, CMPIChar16 character) {
  out += '\'';
  if (character >= 0x20 && character < 0x7f) {
    if (character == '\'' || character == '\\') {
      out += '\\';
    }
    out += static_cast<char>(character);
  } else {
    constexpr std::string_view digits = "0123456789ABCDEF";
    out += "\\x";
    for (int shift = 12; shift >= 0; shift -= 4) {
      out += digits[(static_cast<unsigned>(character) >> static_cast<unsigned>(shift)) & 0xfU];
    }
  }
  out += '\'';
}

template <class Number>
std::string_view shortest(std::array<char, 64>& digits, Number number) {
  const auto result = std::to_chars(digits.data(), digits.data() + digits.size(), number);
  return {digits.data(), static_cast<std::size_t>(result.ptr - digits.data())};
}

template <class Real>
void appendReal(std::string& out, Real number) {
  std::array<char, 64> digits{};
  const std::string_view text = shortest(digits, number);
  out += text;
  if (text.find_first_not_of("-0123456789") == std::string_view::npos) {
    out += ".0";  // or it would read as an integer
  }
}

void appendNumber(std::string& out, const CMPIData& data) {
  std::array<char, 64> digits{};
  if (const auto number = integer(data); number) {
    out += number->isNegative ? shortest(digits, static_cast<std::int64_t>(number->bits))
                              : shortest(digits, number->bits);
  } else if (data.type == CMPI_real32) {
    appendReal(out, data.value.real32);
  } else {
    appendReal(out, data.value.real64);
  }
}

void appendValue(std::string& out, const CMPIData& data, unsigned depth) {
  if (const auto plain = text(data); plain) {
    appendQuoted(out, *plain);
  } else if (const auto time = dateTimeText(data); time) {
    appendQuoted(out, *time);
  } else if (const ObjectPath* const reference = objectPath(data); reference != nullptr) {
    std::string nested;
    appendPath(nested, *reference, depth + 1);
    appendQuoted(out, nested);
  } else if (data.type == CMPI_boolean) {
    out += data.value.boolean != 0 ? "true" : "false";
  } else if (data.type == CMPI_char16) {
    appendChar16(out, data.value.char16);
  } else {
    appendNumber(out, data);
  }
}

void appendPath(std::string& out, const ObjectPath& path, unsigned depth) {
  if (!path.hostName().empty()) {
    out.append("//").append(path.hostName()).append("/");
  }
  if (!path.hostName().empty() || !path.nameSpace().empty()) {
    out.append(path.nameSpace()).append(":");
  }
  out += path.className();
  // Each level of quotes doubles the backslashes of the one inside.
  if (depth == wbemUriDepth) {
    return;
  }
  char separator = '.';
  for (const NamedValue& key : path.keys()) {
    out += separator;
    out.append(key.name).append("=");
    appendValue(out, key.data, depth);
    separator = ',';
  }
}

}  // namespace

std::string formatWbemUri(const ObjectPath& path) {
  std::string out;
  appendPath(out, path, 0);
  return out;
}

}  // namespace cimom
