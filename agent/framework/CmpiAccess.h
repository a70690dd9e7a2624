// Reading CMPI objects of any object manager.
//
// All goes through the function tables of the objects at hand. A table or member that is missing, a null
// answer and a status other than OK read as "not there".
#pragma once

#include <agent/framework/Case.h>

#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>

#include <algorithm>
#include <optional>
#include <string_view>

namespace agent::cmpi {

/// CIM names are compared without case, whatever the locale of the process. Most are spelled the same.
inline bool sameName(std::string_view left, std::string_view right) {
  return left.size() == right.size() &&
         (left == right || std::equal(left.begin(), left.end(), right.begin(),
                                      [](char a, char b) { return lower(a) == lower(b); }));
}

/// The function table of an object; null where there is no object or it has none.
template <typename Object>
auto tableOf(const Object* object) -> decltype(object->ft) {
  return object == nullptr ? nullptr : object->ft;
}

/// The characters of a string object, or null.
inline const char* charsOf(const CMPIString* string) {
  const auto* table = tableOf(string);
  if (table == nullptr || table->getCharPtr == nullptr) {
    return nullptr;
  }
  CMPIStatus status{CMPI_RC_OK, nullptr};
  const char* chars = table->getCharPtr(string, &status);
  return status.rc == CMPI_RC_OK ? chars : nullptr;
}

inline bool hasValue(const CMPIData& data) {
  return (data.state & (CMPI_nullValue | CMPI_notFound | CMPI_badValue)) == 0;
}

/// The characters of a string value; null where it is null or of another type.
inline const char* charsOf(const CMPIData& data) {
  if (!hasValue(data)) {
    return nullptr;
  }
  if (data.type == CMPI_string) {
    return charsOf(data.value.string);
  }
  return data.type == CMPI_chars ? data.value.chars : nullptr;
}

template <typename Object>
using GetNamed = CMPIData (*)(const Object*, const char*, CMPIStatus*);
template <typename Object>
using GetCount = CMPICount (*)(const Object*, CMPIStatus*);
template <typename Object>
using GetAt = CMPIData (*)(const Object*, CMPICount, CMPIString**, CMPIStatus*);

/// Number of keys or properties; 0 where it cannot be had.
template <typename Object>
CMPICount countOf(const Object* object, GetCount<Object> getCount) {
  if (getCount == nullptr) {
    return 0;
  }
  CMPIStatus status{CMPI_RC_OK, nullptr};
  const CMPICount count = getCount(object, &status);
  return status.rc == CMPI_RC_OK ? count : 0;
}

/// The key or property of that name. Where the object manager does not find it as it is spelled, all names
/// are compared without case.
template <typename Object>
std::optional<CMPIData> findByName(const Object* object, const char* name, GetNamed<Object> getNamed,
                                   GetCount<Object> getCount, GetAt<Object> getAt) {
  if (getNamed != nullptr) {
    CMPIStatus status{CMPI_RC_OK, nullptr};
    const CMPIData data = getNamed(object, name, &status);
    if (status.rc == CMPI_RC_OK && (data.state & CMPI_notFound) == 0) {
      return data;
    }
  }
  if (getAt == nullptr) {
    return std::nullopt;
  }
  const CMPICount count = countOf(object, getCount);
  for (CMPICount index = 0; index < count; ++index) {
    CMPIStatus status{CMPI_RC_OK, nullptr};
    CMPIString* itsName = nullptr;
    const CMPIData data = getAt(object, index, &itsName, &status);
    const char* chars = charsOf(itsName);
    if (status.rc == CMPI_RC_OK && chars != nullptr && sameName(chars, name)) {
      return data;
    }
  }
  return std::nullopt;
}

/// Shows each key of a path that can be read: its name, null where that cannot be had, and its value. Object
/// managers may count the keys of the path's class, set or not; reading one that is not set is an error then.
/// False where the number of keys cannot be had.
template <typename Visit>
bool forEachKey(const CMPIObjectPath* path, Visit visit) {
  const auto* table = tableOf(path);
  if (table == nullptr || table->getKeyCount == nullptr || table->getKeyAt == nullptr) {
    return false;
  }
  CMPIStatus counted{CMPI_RC_OK, nullptr};
  const CMPICount count = table->getKeyCount(path, &counted);
  for (CMPICount index = 0; counted.rc == CMPI_RC_OK && index < count; ++index) {
    CMPIStatus status{CMPI_RC_OK, nullptr};
    CMPIString* name = nullptr;
    const CMPIData value = table->getKeyAt(path, index, &name, &status);
    if (status.rc == CMPI_RC_OK) {
      visit(charsOf(name), value);
    }
  }
  return counted.rc == CMPI_RC_OK;
}

}  // namespace agent::cmpi
