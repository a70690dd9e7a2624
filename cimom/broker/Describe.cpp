#include <cimom/broker/Context.h>
#include <cimom/broker/Describe.h>
#include <cimom/broker/Enumeration.h>
#include <cimom/broker/Objects.h>
#include <cimom/broker/Result.h>
#include <cimom/broker/Tables.h>
#include <cimom/broker/Values.h>
#include <cimom/broker/WbemUri.h>

#include <array>
#include <charconv>

namespace cimom {

namespace {

// Every CMPI object begins with a handle and a table, and the table's address says whose object it is.
struct AnyObject {
  const void* hdl;
  const void* ft;
};

template <class Object, class Handle>
const Object* as(const void* object) {
  return Object::from(static_cast<const Handle*>(object));
}

std::string quoted(std::string_view plain) {
  std::string out = "\"";
  for (const char character : plain) {
    if (character == '"' || character == '\\') {
      out += '\\';
    }
    out += character;
  }
  return out += '"';
}

template <class Number>
std::string decimal(Number number) {
  std::array<char, 32> digits{};
  const auto result = std::to_chars(digits.data(), digits.data() + digits.size(), number);
  return {digits.data(), result.ptr};
}

std::string describeNumber(const CMPIData& data) {
  if (const auto number = integer(data); number) {
    return number->isNegative ? decimal(static_cast<std::int64_t>(number->bits)) : decimal(number->bits);
  }
  switch (data.type) {
    case CMPI_boolean:
      return data.value.boolean != 0 ? "true" : "false";
    case CMPI_char16:
      return decimal(data.value.char16);
    case CMPI_real32:
      return decimal(data.value.real32);
    case CMPI_real64:
      return decimal(data.value.real64);
    default:
      return {};
  }
}

std::string describeArray(std::span<const CMPIData> elements) {
  std::string out = "{";
  for (const CMPIData& element : elements) {
    out += (out.size() > 1 ? ", " : "") + describe(element);
  }
  return out += '}';
}

std::string describeInstance(const Instance& instance) {
  std::string out = "instance of " + std::string(instance.className()) + " {";
  for (const NamedValue& property : instance.properties()) {
    out += " " + std::string(property.name) + " = " + describe(property.data) + ";";
  }
  return out += " }";
}

}  // namespace

std::string describe(const CMPIData& data) {
  if (isNull(data)) {
    return "NULL";
  }
  if ((data.type & CMPI_ARRAY) != 0) {
    return describeArray(elements(data));
  }
  switch (data.type) {
    case CMPI_string:
      return quoted(*text(data));
    case CMPI_dateTime:
      return quoted(*dateTimeText(data));
    case CMPI_ref:
      return quoted(formatWbemUri(*objectPath(data)));
    case CMPI_instance:
      return describeInstance(*instance(data));
    default:
      return describeNumber(data);
  }
}

std::string_view typeNameOf(const void* object) {
  const std::array<std::pair<const void*, std::string_view>, 9> types = {{
      {&stringTable, "CMPIString"},
      {&dateTimeTable, "CMPIDateTime"},
      {&arrayTable, "CMPIArray"},
      {&objectPathTable, "CMPIObjectPath"},
      {&instanceTable, "CMPIInstance"},
      {&contextTable, "CMPIContext"},
      {&argsTable, "CMPIArgs"},
      {&enumerationTable, "CMPIEnumeration"},
      {&resultTable, "CMPIResult"},
  }};
  const auto* const any = static_cast<const AnyObject*>(object);
  for (const auto& [table, name] : types) {
    if (any != nullptr && any->hdl != nullptr && any->ft == table) {
      return name;
    }
  }
  return {};
}

std::string describe(const void* object) {
  if (const auto* const string = as<String, CMPIString>(object)) {
    return std::string(string->view());
  }
  if (const auto* const time = as<DateTime, CMPIDateTime>(object)) {
    return std::string(time->view());
  }
  if (const auto* const path = as<ObjectPath, CMPIObjectPath>(object)) {
    return formatWbemUri(*path);
  }
  if (const auto* const instance = as<Instance, CMPIInstance>(object)) {
    return describeInstance(*instance);
  }
  if (const auto* const array = as<Array, CMPIArray>(object)) {
    return describeArray(array->elements());
  }
  return {};
}

}  // namespace cimom
