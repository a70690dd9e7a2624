#include "tests/support/FakeCmpi.h"

#include <strings.h>

#include <algorithm>
#include <cstring>

namespace tests {
namespace {

void set(CMPIStatus* status, CMPIrc rc) {
  if (status != nullptr) {
    *status = {rc, nullptr};
  }
}

constexpr std::size_t dateTimeLength = 25;

/// The bytes of a value of that type: callers hand over the address of a variable of the type, not of a whole
/// CMPIValue. Objects and arrays are pointers.
std::size_t sizeOf(CMPIType type) {
  switch (type) {
    case CMPI_boolean:
    case CMPI_uint8:
    case CMPI_sint8:
      return 1;
    case CMPI_char16:
    case CMPI_uint16:
    case CMPI_sint16:
      return 2;
    case CMPI_uint32:
    case CMPI_sint32:
    case CMPI_real32:
      return 4;
    default:
      return sizeof(void*);
  }
}

}  // namespace

FakeCmpi::FakeCmpi()
    : upcalls{},
      factory{},
      stringTable{},
      pathTable{},
      instanceTable{},
      arrayTable{},
      dateTimeTable{},
      enumerationTable{},
      broker_{} {
  broker_.hdl = this;
  broker_.bft = &upcalls;
  broker_.eft = &factory;
  fillFactory();
  fillUpcalls();
  fillPathTable();
  fillObjectTables();
}

// Counts a call and gives its answer, or the failure that the test wants of it.
template <typename Answer>
Answer FakeCmpi::answer(const char* member, CMPIStatus* status, Answer good) {
  calls.emplace_back(member);
  const auto fault = faults.find(member);
  if (fault == faults.end()) {
    set(status, CMPI_RC_OK);
    return good;
  }
  set(status, fault->second == Fault::Null ? CMPI_RC_OK : CMPI_RC_ERR_FAILED);
  return fault->second == Fault::Status ? good : Answer{};
}

CMPIStatus FakeCmpi::answer(const char* member) {
  calls.emplace_back(member);
  return {faults.contains(member) ? CMPI_RC_ERR_FAILED : CMPI_RC_OK, nullptr};
}

CMPIData FakeCmpi::find(const char* member, const std::vector<Entry>& entries, const char* name,
                        CMPIStatus* status) {
  const auto entry = std::find_if(entries.begin(), entries.end(), [&](const Entry& candidate) {
    return caseMatters ? candidate.name == name : strcasecmp(candidate.name.c_str(), name) == 0;
  });
  if (entry != entries.end()) {
    return answer(member, status, entry->data);
  }
  const CMPIData missing{CMPI_null, CMPI_notFound, {}};
  answer(member, status, missing);
  if (!findsNothingQuietly) {
    set(status, CMPI_RC_ERR_NO_SUCH_PROPERTY);
  }
  return missing;
}

CMPIData FakeCmpi::at(const char* member, const std::vector<Entry>& entries, CMPICount index,
                      CMPIString** name, CMPIStatus* status) {
  if (index >= entries.size()) {
    set(status, CMPI_RC_ERR_NO_SUCH_PROPERTY);
    return {CMPI_null, CMPI_notFound, {}};
  }
  *name = string(entries[index].name.c_str());
  return answer(member, status, entries[index].data);
}

// As object managers do: texts are copied into string objects.
CMPIData FakeCmpi::store(const CMPIValue* value, CMPIType type) {
  if (type == CMPI_chars) {
    return stringData(reinterpret_cast<const char*>(value));
  }
  CMPIData data{type, CMPI_goodValue, {}};
  std::memcpy(&data.value, value, sizeOf(type));
  return data;
}

void FakeCmpi::put(std::vector<Entry>& entries, const char* name, const CMPIData& data) {
  entries.push_back({name, data});
}

CMPIString* FakeCmpi::string(const char* text) {
  auto& object = strings_.emplace_back();
  object = {{&object, &stringTable}, this, {}};
  if (text != nullptr) {
    object.text = text;
  }
  return &object.handle;
}

CMPIObjectPath* FakeCmpi::path(const char* nameSpace, const char* className) {
  auto& object = paths_.emplace_back();
  object = {{&object, &pathTable}, this, nameSpace, className, {}};
  return &object.handle;
}

CMPIInstance* FakeCmpi::newInstance(const CMPIObjectPath* path) {
  auto& object = instances_.emplace_back();
  object = {{&object, &instanceTable}, this, path, {}};
  return &object.handle;
}

CMPIInstance* FakeCmpi::instance(const char* nameSpace, const char* className) {
  return newInstance(path(nameSpace, className));
}

CMPIData FakeCmpi::stringData(const char* text) {
  CMPIData data{CMPI_string, CMPI_goodValue, {}};
  data.value.string = string(text);
  return data;
}

void FakeCmpi::setKey(CMPIObjectPath* path, const char* name, const CMPIData& data) {
  put(of<PathObject>(path)->keys, name, data);
}

void FakeCmpi::setProperty(CMPIInstance* instance, const char* name, const CMPIData& data) {
  put(of<InstanceObject>(instance)->properties, name, data);
}

std::optional<CMPIData> FakeCmpi::key(const CMPIObjectPath* path, const std::string& name) {
  for (const Entry& entry : of<PathObject>(path)->keys) {
    if (entry.name == name) {
      return entry.data;
    }
  }
  return std::nullopt;
}

std::optional<CMPIData> FakeCmpi::property(const CMPIInstance* instance, const std::string& name) {
  for (const Entry& entry : of<InstanceObject>(instance)->properties) {
    if (entry.name == name) {
      return entry.data;
    }
  }
  return std::nullopt;
}

std::vector<CMPIData> FakeCmpi::elements(const CMPIArray* array) {
  return of<ArrayObject>(array)->elements;
}

std::string FakeCmpi::text(const CMPIData& data) {
  return of<StringObject>(data.value.string)->text.value_or("(null)");
}

std::string FakeCmpi::text(const CMPIDateTime* dateTime) {
  return of<DateTimeObject>(dateTime)->text;
}

const std::string& FakeCmpi::nameSpaceOf(const CMPIObjectPath* path) {
  return of<PathObject>(path)->nameSpace;
}

const std::string& FakeCmpi::classOf(const CMPIObjectPath* path) {
  return of<PathObject>(path)->className;
}

void FakeCmpi::fillFactory() {
  factory.ftVersion = CMPICurrentVersion;
  factory.newObjectPath = [](const CMPIBroker* broker, const char* nameSpace, const char* className,
                             CMPIStatus* status) {
    auto* fake = of<FakeCmpi>(broker);
    return fake->answer("newObjectPath", status, fake->path(nameSpace, className));
  };
  factory.newInstance = [](const CMPIBroker* broker, const CMPIObjectPath* path, CMPIStatus* status) {
    auto* fake = of<FakeCmpi>(broker);
    return fake->answer("newInstance", status, fake->newInstance(path));
  };
  factory.newString = [](const CMPIBroker* broker, const char* text, CMPIStatus* status) {
    auto* fake = of<FakeCmpi>(broker);
    return fake->answer("newString", status, fake->string(text));
  };
  factory.newArray = [](const CMPIBroker* broker, CMPICount size, CMPIType type, CMPIStatus* status) {
    auto* fake = of<FakeCmpi>(broker);
    auto& object = fake->arrays_.emplace_back();
    object = {{&object, &fake->arrayTable}, fake, type, {size, CMPIData{type, CMPI_nullValue, {}}}};
    return fake->answer("newArray", status, &object.handle);
  };
  factory.newDateTimeFromChars = [](const CMPIBroker* broker, const char* text, CMPIStatus* status) {
    auto* fake = of<FakeCmpi>(broker);
    auto& object = fake->dateTimes_.emplace_back();
    object = {{&object, &fake->dateTimeTable}, fake, text};
    CMPIDateTime* made = fake->answer("newDateTimeFromChars", status, &object.handle);
    if (object.text.size() != dateTimeLength) {
      set(status, CMPI_RC_ERR_INVALID_PARAMETER);
      return static_cast<CMPIDateTime*>(nullptr);
    }
    return made;
  };
  factory.classPathIsA = [](const CMPIBroker* broker, const CMPIObjectPath* path, const char* className,
                            CMPIStatus* status) {
    auto* fake = of<FakeCmpi>(broker);
    std::string name = classOf(path);
    while (!name.empty() && name != className) {
      name = fake->parentOf[name];
    }
    return fake->answer("classPathIsA", status, static_cast<CMPIBoolean>(name.empty() ? 0 : 1));
  };
}

void FakeCmpi::fillUpcalls() {
  upcalls.brokerVersion = CMPICurrentVersion;
  upcalls.brokerName = "FakeCmpi";
  upcalls.enumerateInstances = [](const CMPIBroker* broker, const CMPIContext*, const CMPIObjectPath* path,
                                  const char**, CMPIStatus* status) {
    auto* fake = of<FakeCmpi>(broker);
    auto& object = fake->enumerations_.emplace_back();
    object = {{&object, &fake->enumerationTable}, fake, {}, 0};
    CMPIEnumeration* made = fake->answer("enumerateInstances", status, &object.handle);
    const CMPIrc rc = fake->source ? fake->source(path, object.instances) : CMPI_RC_ERR_INVALID_CLASS;
    if (rc != CMPI_RC_OK) {
      set(status, rc);
      return static_cast<CMPIEnumeration*>(nullptr);
    }
    return made;
  };
  enumerationTable.ftVersion = CMPICurrentVersion;
  enumerationTable.hasNext = [](const CMPIEnumeration* enumeration, CMPIStatus* status) {
    auto* object = of<EnumerationObject>(enumeration);
    const bool isThere = object->next < object->instances.size();
    return object->owner->answer("hasNext", status, static_cast<CMPIBoolean>(isThere ? 1 : 0));
  };
  enumerationTable.getNext = [](const CMPIEnumeration* enumeration, CMPIStatus* status) {
    auto* object = of<EnumerationObject>(enumeration);
    CMPIData data{CMPI_instance, CMPI_goodValue, {}};
    if (object->next == object->instances.size()) {
      object->owner->answer("getNext", status, data);
      set(status, CMPI_RC_ERR_NOT_FOUND);
      return CMPIData{CMPI_null, CMPI_notFound, {}};
    }
    data.value.inst = object->instances[object->next++];
    return object->owner->answer("getNext", status, data);
  };
}

void FakeCmpi::fillPathTable() {
  pathTable.ftVersion = CMPICurrentVersion;
  pathTable.getNameSpace = [](const CMPIObjectPath* path, CMPIStatus* status) {
    auto* object = of<PathObject>(path);
    return object->owner->answer("getNameSpace", status, object->owner->string(object->nameSpace.c_str()));
  };
  pathTable.getClassName = [](const CMPIObjectPath* path, CMPIStatus* status) {
    auto* object = of<PathObject>(path);
    return object->owner->answer("getClassName", status, object->owner->string(object->className.c_str()));
  };
  pathTable.addKey = [](CMPIObjectPath* path, const char* name, const CMPIValue* value, const CMPIType type) {
    auto* object = of<PathObject>(path);
    put(object->keys, name, object->owner->store(value, type));
    return object->owner->answer("addKey");
  };
  pathTable.getKey = [](const CMPIObjectPath* path, const char* name, CMPIStatus* status) {
    auto* object = of<PathObject>(path);
    return object->owner->find("getKey", object->keys, name, status);
  };
  pathTable.getKeyAt = [](const CMPIObjectPath* path, CMPICount index, CMPIString** name,
                          CMPIStatus* status) {
    auto* object = of<PathObject>(path);
    return object->owner->at("getKeyAt", object->keys, index, name, status);
  };
  pathTable.getKeyCount = [](const CMPIObjectPath* path, CMPIStatus* status) {
    auto* object = of<PathObject>(path);
    return object->owner->answer("getKeyCount", status, static_cast<CMPICount>(object->keys.size()));
  };
}

void FakeCmpi::fillObjectTables() {
  instanceTable.ftVersion = CMPICurrentVersion;
  instanceTable.getProperty = [](const CMPIInstance* instance, const char* name, CMPIStatus* status) {
    auto* object = of<InstanceObject>(instance);
    return object->owner->find("getProperty", object->properties, name, status);
  };
  instanceTable.getPropertyAt = [](const CMPIInstance* instance, CMPICount index, CMPIString** name,
                                   CMPIStatus* status) {
    auto* object = of<InstanceObject>(instance);
    return object->owner->at("getPropertyAt", object->properties, index, name, status);
  };
  instanceTable.getPropertyCount = [](const CMPIInstance* instance, CMPIStatus* status) {
    auto* object = of<InstanceObject>(instance);
    return object->owner->answer("getPropertyCount", status,
                                 static_cast<CMPICount>(object->properties.size()));
  };
  instanceTable.getObjectPath = [](const CMPIInstance* instance, CMPIStatus* status) {
    auto* object = of<InstanceObject>(instance);
    return object->owner->answer("getObjectPath", status, const_cast<CMPIObjectPath*>(object->path));
  };
  instanceTable.setProperty = [](const CMPIInstance* instance, const char* name, const CMPIValue* value,
                                 CMPIType type) {
    auto* object = of<InstanceObject>(instance);
    put(object->properties, name, object->owner->store(value, type));
    return object->owner->answer("setProperty");
  };
  arrayTable.ftVersion = CMPICurrentVersion;
  arrayTable.setElementAt = [](CMPIArray* array, CMPICount index, const CMPIValue* value, CMPIType type) {
    auto* object = of<ArrayObject>(array);
    const CMPIData data = object->owner->store(value, type);
    if (index >= object->elements.size() || data.type != object->type) {
      return CMPIStatus{CMPI_RC_ERR_INVALID_PARAMETER, nullptr};
    }
    object->elements[index] = data;
    return object->owner->answer("setElementAt");
  };
  stringTable.ftVersion = CMPICurrentVersion;
  stringTable.getCharPtr = [](const CMPIString* string, CMPIStatus* status) {
    auto* object = of<StringObject>(string);
    return object->owner->answer("getCharPtr", status, object->text ? object->text->c_str() : nullptr);
  };
}

}  // namespace tests
