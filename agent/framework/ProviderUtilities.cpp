#include <Oru/ProviderUtilities.h>
#include <agent/framework/CmpiAccess.h>
#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>

#include <algorithm>
#include <array>
#include <limits>
#include <optional>
#include <string_view>

namespace Oru {
namespace {

using agent::cmpi::charsOf;
using agent::cmpi::findByName;
using agent::cmpi::forEachKey;
using agent::cmpi::hasValue;
using agent::cmpi::sameName;
using agent::cmpi::tableOf;

constexpr unsigned short unknownClass = 255;

struct ClassEntry {
  std::string_view name;
  unsigned short id;
};

constexpr std::array<ClassEntry, 8> classTable{{
    {"KELVO_SoftwareIdentity", 2},
    {"KELVO_InstalledSoftwareIdentity", 3},
    {"KELVO_NetworkSoftwareIdentity", 35},
    {"KELVO_BMCSoftwareIdentity", 117},
    {"KELVO_BIOSSoftwareIdentity", 118},
    {"KELVO_ComputerSystem", 1},
    {"KELVO_NetworkPort", 17},
    {"KELVO_SPComputerSystem", 119},
}};

constexpr std::array<std::string_view, 3> monikerKeys{"InstanceID", "Name", "DeviceID"};

const CMPIBrokerEncFT* factoryOf(const CMPIBroker* broker) {
  return broker == nullptr ? nullptr : broker->eft;
}

bool readText(const std::optional<CMPIData>& data, std::string& value) {
  const char* chars = data ? charsOf(*data) : nullptr;
  if (chars == nullptr) {
    return false;
  }
  value = chars;
  return true;
}

std::optional<CMPIData> findKey(const CMPIObjectPath* path, const char* name) {
  const auto* table = tableOf(path);
  if (table == nullptr || name == nullptr) {
    return std::nullopt;
  }
  return findByName<CMPIObjectPath>(path, name, table->getKey, table->getKeyCount, table->getKeyAt);
}

void addKey(CMPIObjectPath* path, const char* name, const CMPIValue* value, CMPIType type) {
  const auto* table = tableOf(path);
  if (table != nullptr && table->addKey != nullptr && name != nullptr) {
    table->addKey(path, name, value, type);
  }
}

void setValue(CMPIInstance* instance, const char* name, const CMPIValue* value, CMPIType type) {
  const auto* table = tableOf(instance);
  if (table != nullptr && table->setProperty != nullptr && name != nullptr) {
    table->setProperty(instance, name, value, type);
  }
}

/// As CMPI hands over a text of type CMPI_chars: the value pointer is the text.
const CMPIValue* asChars(const std::string& text) {
  return reinterpret_cast<const CMPIValue*>(text.c_str());
}

/// Sets an array property from `count` elements, each given by `valueAt(index)` and of type `elementType`. An
/// array that cannot be made whole stays unset.
template <typename ValueAt>
void setArray(const CMPIBroker* broker, CMPIInstance* instance, const char* name, std::size_t count,
              CMPIType arrayOf, CMPIType elementType, ValueAt valueAt) {
  const auto* factory = factoryOf(broker);
  if (factory == nullptr || factory->newArray == nullptr || tableOf(instance) == nullptr) {
    return;
  }
  CMPIStatus status{CMPI_RC_OK, nullptr};
  CMPIArray* array = factory->newArray(broker, static_cast<CMPICount>(count), arrayOf, &status);
  const auto* table = tableOf(array);
  if (status.rc != CMPI_RC_OK || table == nullptr || table->setElementAt == nullptr) {
    return;
  }
  for (std::size_t index = 0; index < count; ++index) {
    status = table->setElementAt(array, static_cast<CMPICount>(index), valueAt(index), elementType);
    if (status.rc != CMPI_RC_OK) {
      return;
    }
  }
  CMPIValue value{};
  value.array = array;
  setValue(instance, name, &value, static_cast<CMPIType>(arrayOf | CMPI_ARRAY));
}

}  // namespace

unsigned short ProviderUtilities::getClassId(const CMPIObjectPath* path) {
  const auto* table = tableOf(path);
  if (table == nullptr || table->getClassName == nullptr) {
    return unknownClass;
  }
  CMPIStatus status{CMPI_RC_OK, nullptr};
  const CMPIString* className = table->getClassName(path, &status);
  return status.rc == CMPI_RC_OK ? getClassId(charsOf(className)) : unknownClass;
}

unsigned short ProviderUtilities::getClassId(const char* className) {
  if (className == nullptr) {
    return unknownClass;
  }
  for (const ClassEntry& entry : classTable) {
    if (sameName(entry.name, className)) {
      return entry.id;
    }
  }
  return unknownClass;
}

bool ProviderUtilities::areClassesRelated(const CMPIBroker* broker, const std::string& nameSpace,
                                          const char* className, const char* otherClassName) {
  if (className == nullptr) {
    return true;
  }
  if (otherClassName == nullptr) {
    return false;
  }
  if (sameName(className, otherClassName)) {
    return true;
  }
  const auto* factory = factoryOf(broker);
  const CMPIObjectPath* path = createObjectPath(broker, className, nameSpace);
  if (path == nullptr || factory->classPathIsA == nullptr) {
    return false;
  }
  CMPIStatus status{CMPI_RC_OK, nullptr};
  const CMPIBoolean isA = factory->classPathIsA(broker, path, otherClassName, &status);
  return status.rc == CMPI_RC_OK && isA != 0;
}

std::string ProviderUtilities::getNamespace(const CMPIObjectPath* path) {
  const auto* table = tableOf(path);
  if (table == nullptr || table->getNameSpace == nullptr) {
    return {};
  }
  CMPIStatus status{CMPI_RC_OK, nullptr};
  const CMPIString* nameSpace = table->getNameSpace(path, &status);
  const char* chars = status.rc == CMPI_RC_OK ? charsOf(nameSpace) : nullptr;
  return chars == nullptr ? std::string() : std::string(chars);
}

unsigned short ProviderUtilities::getKeyCount(const CMPIObjectPath* path) {
  constexpr unsigned int most = std::numeric_limits<unsigned short>::max();
  unsigned int count = 0;
  forEachKey(path,
             [&count](const char* /*name*/, const CMPIData& value) { count += hasValue(value) ? 1 : 0; });
  return static_cast<unsigned short>(std::min(count, most));
}

bool ProviderUtilities::getKeyProperty(const CMPIObjectPath* path, const char* name, std::string& value) {
  return readText(findKey(path, name), value);
}

bool ProviderUtilities::getKeyProperty(const CMPIObjectPath* path, const char* name, CMPIObjectPath** value) {
  const std::optional<CMPIData> data = findKey(path, name);
  if (!data || value == nullptr || !hasValue(*data) || data->type != CMPI_ref || data->value.ref == nullptr) {
    return false;
  }
  *value = data->value.ref;
  return true;
}

void ProviderUtilities::setKeyProperty(CMPIObjectPath* path, const char* name, const std::string& value) {
  addKey(path, name, asChars(value), CMPI_chars);
}

void ProviderUtilities::setKeyProperty(CMPIObjectPath* path, const char* name, CMPIObjectPath* value) {
  if (value != nullptr) {
    CMPIValue reference{};
    reference.ref = value;
    addKey(path, name, &reference, CMPI_ref);
  }
}

// NOLINTBEGIN(performance-unnecessary-value-param): the contract passes the namespace by value.
CMPIObjectPath* ProviderUtilities::createObjectPath(const CMPIBroker* broker, const char* className,
                                                    std::string nameSpace) {
  const auto* factory = factoryOf(broker);
  if (factory == nullptr || factory->newObjectPath == nullptr || className == nullptr) {
    return nullptr;
  }
  CMPIStatus status{CMPI_RC_OK, nullptr};
  CMPIObjectPath* path = factory->newObjectPath(broker, nameSpace.c_str(), className, &status);
  return status.rc == CMPI_RC_OK ? path : nullptr;
}
// NOLINTEND(performance-unnecessary-value-param)

CMPIInstance* ProviderUtilities::createInstance(const CMPIBroker* broker, CMPIObjectPath* path) {
  const auto* factory = factoryOf(broker);
  if (factory == nullptr || factory->newInstance == nullptr || path == nullptr) {
    return nullptr;
  }
  CMPIStatus status{CMPI_RC_OK, nullptr};
  CMPIInstance* instance = factory->newInstance(broker, path, &status);
  return status.rc == CMPI_RC_OK ? instance : nullptr;
}

bool ProviderUtilities::getProperty(const CMPIInstance* instance, const char* name, std::string& value,
                                    bool /*flag*/) {
  const auto* table = tableOf(instance);
  return table != nullptr && name != nullptr &&
         readText(findByName<CMPIInstance>(instance, name, table->getProperty, table->getPropertyCount,
                                           table->getPropertyAt),
                  value);
}

void ProviderUtilities::setProperty(CMPIInstance* instance, const char* name, std::string& value) {
  setValue(instance, name, asChars(value), CMPI_chars);
}

void ProviderUtilities::setProperty(CMPIInstance* instance, const char* name, unsigned short value) {
  CMPIValue number{};
  number.uint16 = value;
  setValue(instance, name, &number, CMPI_uint16);
}

void ProviderUtilities::setProperty(CMPIInstance* instance, const char* name, bool value) {
  CMPIValue boolean{};
  boolean.boolean = value ? 1 : 0;
  setValue(instance, name, &boolean, CMPI_boolean);
}

void ProviderUtilities::setProperty(CMPIInstance* instance, const char* name, CMPIObjectPath* value) {
  if (value != nullptr) {
    CMPIValue reference{};
    reference.ref = value;
    setValue(instance, name, &reference, CMPI_ref);
  }
}

void ProviderUtilities::setProperty(const CMPIBroker* broker, CMPIInstance* instance, const char* name,
                                    std::string& value, bool isDateTime) {
  if (!isDateTime) {
    setProperty(instance, name, value);
    return;
  }
  const auto* factory = factoryOf(broker);
  if (factory == nullptr || factory->newDateTimeFromChars == nullptr) {
    return;
  }
  CMPIStatus status{CMPI_RC_OK, nullptr};
  CMPIValue dateTime{};
  dateTime.dateTime = factory->newDateTimeFromChars(broker, value.c_str(), &status);
  if (status.rc == CMPI_RC_OK && dateTime.dateTime != nullptr) {
    setValue(instance, name, &dateTime, CMPI_dateTime);
  }
}

void ProviderUtilities::setProperty(const CMPIBroker* broker, CMPIInstance* instance, const char* name,
                                    std::vector<unsigned short>& values) {
  CMPIValue element{};
  setArray(broker, instance, name, values.size(), CMPI_uint16, CMPI_uint16, [&](std::size_t index) {
    element.uint16 = values[index];
    return &element;
  });
}

void ProviderUtilities::setProperty(const CMPIBroker* broker, CMPIInstance* instance, const char* name,
                                    std::vector<std::string>& values) {
  setArray(broker, instance, name, values.size(), CMPI_string, CMPI_chars,
           [&](std::size_t index) { return asChars(values[index]); });
}

void ProviderUtilities::transformObjectPathToMoniker(const CMPIObjectPath* path, Moniker& moniker) {
  forEachKey(path, [&moniker](const char* name, const CMPIData& data) {
    const char* value = name == nullptr ? nullptr : charsOf(data);
    if (value == nullptr) {
      return;
    }
    const auto* known = std::find_if(monikerKeys.begin(), monikerKeys.end(),
                                     [name](std::string_view key) { return sameName(key, name); });
    moniker.addKey(known == monikerKeys.end() ? std::string(name) : std::string(*known), value);
  });
}

void ProviderUtilities::transformMonikerToObjectPath(Moniker& moniker, CMPIObjectPath** path) {
  if (path == nullptr || *path == nullptr) {
    return;
  }
  const unsigned int count = moniker.getKeyCount();
  for (unsigned int index = 0; index < count; ++index) {
    std::string name;
    std::string value;
    if (moniker.selectKey(index) && moniker.getName(name) && moniker.getValue(value)) {
      setKeyProperty(*path, name.c_str(), value);
    }
  }
}

}  // namespace Oru
