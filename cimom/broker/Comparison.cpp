#include <cimom/broker/Objects.h>
#include <cimom/broker/Values.h>

#include <algorithm>
#include <functional>
#include <string_view>

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

// For values that are the same in a key, the same; for others of the rarer types, too.
std::size_t keyHash(const CMPIData& data) {
  if (isNull(data)) {
    return 0;
  }
  if (const auto number = integer(data); number) {
    return std::hash<std::uint64_t>()(number->bits);
  }
  switch (data.type) {
    case CMPI_string:
      return std::hash<std::string_view>()(*text(data));
    case CMPI_dateTime:
      return std::hash<std::string_view>()(*dateTimeText(data));
    case CMPI_ref:
      return pathHash(*objectPath(data));
    default:
      return data.type;
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

std::size_t pathHash(const ObjectPath& path) {
  // The odd factor ties a value to its name; the sum does not know the order of the keys.
  constexpr std::size_t factor = 0x9e3779b97f4a7c15U;
  std::size_t hash = NameHash()(path.className());
  for (const NamedValue& key : path.keys()) {
    hash += (NameHash()(key.name) ^ keyHash(key.data)) * factor;
  }
  return hash;
}

}  // namespace cimom
