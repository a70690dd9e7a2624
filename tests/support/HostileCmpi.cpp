#include "tests/support/HostileCmpi.h"

#include <strings.h>
#include <sys/mman.h>
#include <unistd.h>

#include <algorithm>
#include <cstddef>
#include <cstring>
#include <stdexcept>

namespace tests {
namespace {

std::size_t pageSize() {
  return static_cast<std::size_t>(sysconf(_SC_PAGESIZE));
}

template <typename Answer>
Answer good(CMPIStatus* status, Answer answer) {
  if (status != nullptr) {
    *status = {CMPI_RC_OK, nullptr};
  }
  return answer;
}

/// As object managers mark what is read from a path.
CMPIData asKey(CMPIData data) {
  data.state = static_cast<CMPIValueState>(data.state | CMPI_keyValue);
  return data;
}

bool isCalled(const std::string& name, const std::string& other) {
  return strcasecmp(name.c_str(), other.c_str()) == 0;
}

}  // namespace

HostileCmpi::HostileCmpi() {
  fillHostileTables();
}

HostileCmpi::~HostileCmpi() {
  if (pages_ != nullptr) {
    munmap(pages_, 2 * pageSize());
  }
}

void HostileCmpi::endFactoryEarly() {
  constexpr std::size_t length = offsetof(CMPIBrokerEncFT, newCMPIError);
  pages_ = mmap(nullptr, 2 * pageSize(), PROT_READ | PROT_WRITE, MAP_PRIVATE | MAP_ANONYMOUS, -1, 0);
  if (pages_ == MAP_FAILED || mprotect(static_cast<char*>(pages_) + pageSize(), pageSize(), PROT_NONE) != 0) {
    throw std::runtime_error("no pages for the factory");
  }
  char* const table = static_cast<char*>(pages_) + pageSize() - length;
  std::memcpy(table, &factory, length);
  broker_.eft = reinterpret_cast<CMPIBrokerEncFT*>(table);
}

void HostileCmpi::dropObjects() {
  strings_.clear();
  paths_.clear();
  instances_.clear();
  arrays_.clear();
  dateTimes_.clear();
  enumerations_.clear();
}

std::vector<std::string> HostileCmpi::countedNames(const PathObject& path) {
  std::vector<std::string> names;
  const auto& counted = static_cast<HostileCmpi*>(path.owner)->countedKeys;
  if (const auto found = counted.find(path.className); found != counted.end()) {
    names = found->second;
  }
  for (const Entry& key : path.keys) {
    if (std::none_of(names.begin(), names.end(),
                     [&](const auto& name) { return isCalled(name, key.name); })) {
      names.push_back(key.name);
    }
  }
  return names;
}

const FakeCmpi::Entry* HostileCmpi::keyAt(const PathObject& path, CMPICount index) {
  const std::vector<std::string> names = countedNames(path);
  const auto found = std::find_if(path.keys.begin(), path.keys.end(), [&](const Entry& key) {
    return index < names.size() && isCalled(key.name, names[index]);
  });
  return found == path.keys.end() ? nullptr : &*found;
}

void HostileCmpi::fillHostileTables() {
  pathTable.getKeyCount = [](const CMPIObjectPath* path, CMPIStatus* status) {
    auto* object = of<PathObject>(path);
    return good(status, static_cast<CMPICount>(countedNames(*object).size()));
  };
  pathTable.getKeyAt = [](const CMPIObjectPath* path, CMPICount index, CMPIString** name,
                          CMPIStatus* status) {
    auto* object = of<PathObject>(path);
    const Entry* key = keyAt(*object, index);
    if (key == nullptr) {
      *status = {CMPI_RC_ERR_NOT_FOUND, nullptr};
      return CMPIData{CMPI_string, CMPI_goodValue, {}};  // the status alone says that it means nothing
    }
    *name = object->owner->string(key->name.c_str());
    return good(status, asKey(key->data));
  };
  pathTable.getKey = [](const CMPIObjectPath* path, const char* name, CMPIStatus* status) {
    auto* object = of<PathObject>(path);
    auto* host = static_cast<HostileCmpi*>(object->owner);
    return asKey(host->find("getKey", object->keys, name, status));
  };
  factory.newInstance = [](const CMPIBroker* broker, const CMPIObjectPath* path, CMPIStatus* status) {
    auto* host = static_cast<HostileCmpi*>(of<FakeCmpi>(broker));
    CMPIInstance* made = host->newInstance(path);
    if (host->instancesTakeKeys) {
      of<InstanceObject>(made)->properties = of<PathObject>(path)->keys;
    }
    return good(status, made);
  };
  instanceTable.setProperty = [](const CMPIInstance* instance, const char* name, const CMPIValue* value,
                                 CMPIType type) {
    auto* object = of<InstanceObject>(instance);
    auto* host = static_cast<HostileCmpi*>(object->owner);
    if (host->typeOf) {
      const std::string& className = classOf(object->path);
      const std::optional<CMPIType> declared = host->typeOf(className, name);
      if (!declared) {
        host->unknown.push_back(className + "." + name);
        return CMPIStatus{CMPI_RC_OK, nullptr};
      }
      if (*declared != (type == CMPI_chars ? CMPI_string : type)) {
        host->refused.push_back(className + "." + name);
        return CMPIStatus{CMPI_RC_ERR_INVALID_DATA_TYPE, nullptr};
      }
    }
    std::erase_if(object->properties, [name](const Entry& each) { return isCalled(each.name, name); });
    put(object->properties, name, host->store(value, type));
    return CMPIStatus{CMPI_RC_OK, nullptr};
  };
  instanceTable.getProperty = [](const CMPIInstance* instance, const char* name, CMPIStatus* status) {
    auto* object = of<InstanceObject>(instance);
    auto* host = static_cast<HostileCmpi*>(object->owner);
    const bool isSet = std::any_of(object->properties.begin(), object->properties.end(),
                                   [name](const Entry& each) { return isCalled(each.name, name); });
    const std::optional<CMPIType> declared =
        host->typeOf && !isSet ? host->typeOf(classOf(object->path), name) : std::nullopt;
    return declared ? good(status, CMPIData{*declared, CMPI_nullValue, {}})
                    : host->find("getProperty", object->properties, name, status);
  };
}

HostileCmpi::Values HostileCmpi::keysOf(const CMPIObjectPath* path) {
  Values values;
  for (const Entry& each : of<PathObject>(path)->keys) {
    values.emplace_back(each.name, each.data);
  }
  return values;
}

HostileCmpi::Values HostileCmpi::propertiesOf(const CMPIInstance* instance) {
  Values values;
  for (const Entry& each : of<InstanceObject>(instance)->properties) {
    values.emplace_back(each.name, each.data);
  }
  return values;
}

const CMPIObjectPath* HostileCmpi::pathOf(const CMPIInstance* instance) {
  return of<InstanceObject>(instance)->path;
}

CMPIType HostileCmpi::elementTypeOf(const CMPIArray* array) {
  return of<ArrayObject>(array)->type;
}

}  // namespace tests
