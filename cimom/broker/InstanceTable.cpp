#include <cimom/broker/Objects.h>
#include <cimom/broker/Tables.h>
#include <cimom/broker/Values.h>

#include <string_view>
#include <vector>

namespace cimom {

class InstanceCalls {
 public:
  static void setFilter(Instance& instance, std::span<const std::string_view> names) {
    instance.setFilter(names);
  }
  static void clearFilter(Instance& instance) { instance.allowed_ = nullptr; }
};

namespace {

CMPIData getProperty(const CMPIInstance* handle, const char* name, CMPIStatus* status) {
  const Instance* const instance = Instance::from(handle);
  if (instance == nullptr) {
    return noData(status, CMPI_RC_ERR_INVALID_HANDLE);
  }
  if (name == nullptr) {
    return noData(status, CMPI_RC_ERR_INVALID_PARAMETER);
  }
  const PropertyInfo* const declared = instance->classInfo().find(name);
  if (declared == nullptr) {
    return noData(status, CMPI_RC_ERR_NO_SUCH_PROPERTY);
  }
  setStatus(status, CMPI_RC_OK);
  const NamedValue* const property = instance->find(name);
  return property == nullptr ? nullData(declared->type) : answerWith(*instance->arena(), property->data);
}

CMPIData getPropertyAt(const CMPIInstance* handle, CMPICount index, CMPIString** name, CMPIStatus* status) {
  const Instance* const instance = Instance::from(handle);
  if (instance == nullptr) {
    return noData(status, CMPI_RC_ERR_INVALID_HANDLE);
  }
  if (index >= instance->properties().size()) {
    return noData(status, CMPI_RC_ERR_NO_SUCH_PROPERTY);
  }
  const NamedValue& property = instance->properties()[index];
  if (name != nullptr) {
    *name = instance->classInfo().find(property.name)->nameString;
  }
  setStatus(status, CMPI_RC_OK);
  return answerWith(*instance->arena(), property.data);
}

CMPICount getPropertyCount(const CMPIInstance* handle, CMPIStatus* status) {
  const Instance* const instance = Instance::from(handle);
  setStatus(status, instance == nullptr ? CMPI_RC_ERR_INVALID_HANDLE : CMPI_RC_OK);
  return instance == nullptr ? 0 : static_cast<CMPICount>(instance->properties().size());
}

CMPIStatus setProperty(const CMPIInstance* handle, const char* name, const CMPIValue* value, CMPIType type) {
  Instance* const instance = Instance::from(handle);
  if (instance == nullptr) {
    return makeStatus(CMPI_RC_ERR_INVALID_HANDLE);
  }
  return makeStatus(name == nullptr ? CMPI_RC_ERR_INVALID_PARAMETER
                                    : instance->setProperty(name, value, type));
}

// Which class introduced a property is for the schema to say: the origin is taken and not kept.
CMPIStatus setPropertyWithOrigin(const CMPIInstance* handle, const char* name, const CMPIValue* value,
                                 const CMPIType type, const char* /*origin*/) {
  return setProperty(handle, name, value, type);
}

CMPIObjectPath* getObjectPath(const CMPIInstance* handle, CMPIStatus* status) {
  const Instance* const instance = Instance::from(handle);
  if (instance == nullptr) {
    return noObject(status, CMPI_RC_ERR_INVALID_HANDLE);
  }
  setStatus(status, CMPI_RC_OK);
  return instance->path().copyTo(arenaForCopies(*instance->arena()));
}

CMPIStatus setPropertyFilter(CMPIInstance* handle, const char** properties, const char** keys) {
  Instance* const instance = Instance::from(handle);
  if (instance == nullptr) {
    return makeStatus(CMPI_RC_ERR_INVALID_HANDLE);
  }
  if (properties == nullptr) {
    InstanceCalls::clearFilter(*instance);
    return makeStatus(CMPI_RC_OK);
  }
  std::vector<std::string_view> names;
  for (const char** list : {properties, keys}) {
    for (const char** name = list; name != nullptr && *name != nullptr; ++name) {
      names.emplace_back(*name);
    }
  }
  InstanceCalls::setFilter(*instance, names);
  return makeStatus(CMPI_RC_OK);
}

CMPIStatus setObjectPath(CMPIInstance* handle, const CMPIObjectPath* path) {
  Instance* const instance = Instance::from(handle);
  const ObjectPath* const source = ObjectPath::from(path);
  if (instance == nullptr) {
    return makeStatus(CMPI_RC_ERR_INVALID_HANDLE);
  }
  return makeStatus(source == nullptr ? CMPI_RC_ERR_INVALID_PARAMETER : instance->setPath(*source));
}

}  // namespace

CMPIInstanceFT instanceTable = {
    tableVersion,      releaseHandle<Instance>, cloneHandle<Instance>, getProperty,
    getPropertyAt,     getPropertyCount,        setProperty,           getObjectPath,
    setPropertyFilter, setObjectPath,           setPropertyWithOrigin,
};

}  // namespace cimom
