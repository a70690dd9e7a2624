#include <cimom/broker/Objects.h>
#include <cimom/broker/Values.h>

#include <algorithm>

namespace cimom {

namespace {

bool sameElements(std::span<const CMPIData> left, std::span<const CMPIData> right) {
  return std::equal(left.begin(), left.end(), right.begin(), right.end(), sameValue);
}

bool sameProperties(const Instance& left, const Instance& right) {
  const auto isIn = [&right](const NamedValue& property) {
    const NamedValue* const other = right.find(property.name);
    return other != nullptr && sameValue(property.data, other->data);
  };
  const auto all = left.properties();
  return sameName(left.className(), right.className()) && all.size() == right.properties().size() &&
         std::all_of(all.begin(), all.end(), isIn);
}

// Comparison of values that are neither null nor of different types.
bool sameContent(const CMPIData& left, const CMPIData& right) {
  if ((left.type & CMPI_ARRAY) != 0) {
    return sameElements(elements(left), elements(right));
  }
  switch (left.type) {
    case CMPI_string:
      return text(left) == text(right);
    case CMPI_dateTime:
      return dateTimeText(left) == dateTimeText(right);
    case CMPI_ref:
      return samePath(*objectPath(left), *objectPath(right));
    case CMPI_instance:
      return sameProperties(*instance(left), *instance(right));
    case CMPI_boolean:
      return left.value.boolean == right.value.boolean;
    case CMPI_char16:
      return left.value.char16 == right.value.char16;
    case CMPI_real32:
      return left.value.real32 == right.value.real32;
    case CMPI_real64:
      return left.value.real64 == right.value.real64;
    default:
      return integer(left) == integer(right);
  }
}

}  // namespace

bool sameValue(const CMPIData& left, const CMPIData& right) {
  if (isNull(left) || isNull(right)) {
    return isNull(left) && isNull(right);
  }
  return left.type == right.type && sameContent(left, right);
}

bool samePath(const ObjectPath& left, const ObjectPath& right) {
  const auto isIn = [&right](const NamedValue& key) {
    const NamedValue* const other = right.find(key.name);
    if (other == nullptr) {
      return false;
    }
    const auto number = integer(key.data);
    return number ? number == integer(other->data) : sameValue(key.data, other->data);
  };
  const auto all = left.keys();
  return sameName(left.className(), right.className()) && all.size() == right.keys().size() &&
         std::all_of(all.begin(), all.end(), isIn);
}

}  // namespace cimom
