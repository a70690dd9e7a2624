// The broker's upcalls over the scripted world, and the instances that they deliver.
#include "StandIn.h"

namespace standin {

namespace {

void set(CMPIStatus* status, CMPIrc code) {
  if (status != nullptr) {
    *status = {code, nullptr};
  }
}

World::Enumeration& unwrap(const CMPIEnumeration* enumeration) {
  return *static_cast<World::Enumeration*>(enumeration->hdl);
}

CMPIBoolean hasNext(const CMPIEnumeration* enumeration, CMPIStatus* status) {
  World::Enumeration& self = unwrap(enumeration);
  const bool fails = world().record("hasNext", false);
  set(status, fails ? CMPI_RC_ERR_FAILED : CMPI_RC_OK);
  const std::size_t call = self.hasNextCalls++;
  if (fails) {
    return 0;
  }
  if (call < self.answer.hasNextAnswers.size()) {
    return self.answer.hasNextAnswers[call];
  }
  return self.next < self.answer.instances.size() ? 1 : 0;
}

// An element whose status is bad is there all the same: whoever takes it shows.
CMPIData getNext(const CMPIEnumeration* enumeration, CMPIStatus* status) {
  World::Enumeration& self = unwrap(enumeration);
  const bool fails = world().record("getNext", false);
  CMPIData data{CMPI_instance, CMPI_goodValue, {}};
  if (self.next >= self.answer.instances.size()) {
    set(status, CMPI_RC_ERR_NOT_FOUND);
    return data;
  }
  Instance* const instance = self.answer.instances[self.next++];
  data.value.inst = instance != nullptr ? &instance->cmpi : nullptr;
  set(status, fails || self.next == self.answer.failingElement ? CMPI_RC_ERR_FAILED : CMPI_RC_OK);
  return data;
}

CMPIObjectPath* getObjectPath(const CMPIInstance* instance, CMPIStatus* status) {
  auto* const self = static_cast<Instance*>(instance->hdl);
  const bool fails = world().record("getObjectPath", false) || self == nullptr;
  set(status, fails ? CMPI_RC_ERR_FAILED : CMPI_RC_OK);
  // A path that comes with a bad status shows whoever takes it.
  return self != nullptr ? &self->path->cmpi : nullptr;
}

CMPIEnumeration* enumerateInstances(const CMPIBroker* broker, const CMPIContext* context,
                                    const CMPIObjectPath* path, const char** properties, CMPIStatus* status) {
  const Path* const asked = path != nullptr ? static_cast<Path*>(path->hdl) : nullptr;
  const bool fails = world().record("enumerateInstances(" + describe(asked) + ")", false);
  world().brokersUsed.push_back(broker);
  world().upcalls.push_back({broker, context, asked, properties});
  if (fails || asked == nullptr || !world().served.contains(asked->className)) {
    set(status, fails ? CMPI_RC_ERR_FAILED : CMPI_RC_ERR_INVALID_CLASS);
    return nullptr;
  }
  const Served& answer = world().served.at(asked->className);
  set(status, answer.status);
  return answer.enumerationIsNull ? nullptr : world().newEnumeration(answer, *asked);
}

CMPIInstanceFT makeInstanceTable() {
  CMPIInstanceFT table{};
  table.ftVersion = CMPICurrentVersion;
  table.getObjectPath = getObjectPath;
  return table;
}

CMPIEnumerationFT makeEnumerationTable() {
  CMPIEnumerationFT table{};
  table.ftVersion = CMPICurrentVersion;
  table.hasNext = hasNext;
  table.getNext = getNext;
  return table;
}

CMPIInstanceFT instanceTable = makeInstanceTable();
CMPIEnumerationFT enumerationTable = makeEnumerationTable();

bool differs(const Instance& instance, const Path& path) {
  for (const auto& [name, value] : path.keys) {
    for (const auto& [property, its] : instance.properties) {
      if (property == name && its != value) {
        return true;
      }
    }
  }
  return false;
}

}  // namespace

std::string describe(const Path* path) {
  if (path == nullptr) {
    return "(null)";
  }
  std::string text = path->className;
  char separator = '.';
  for (const auto& [name, value] : path->keys) {
    text.append(1, separator).append(name).append("=").append(value);
    separator = ',';
  }
  for (const auto& [name, value] : path->references) {
    text.append(1, separator).append(name).append("={").append(describe(value)).append("}");
    separator = ',';
  }
  return text;
}

Instance* World::newInstance(Path* path) {
  auto& instance = instances_.emplace_back(std::make_unique<Instance>());
  instance->path = path;
  instance->cmpi = {instance.get(), &instanceTable};
  return instance.get();
}

Instance* World::newInstance(std::string className, std::vector<std::pair<std::string, std::string>> keys) {
  Path* const path = newPath(std::move(className));
  path->keys = std::move(keys);
  Instance* const instance = newInstance(path);
  instance->properties = path->keys;
  return instance;
}

CMPIBroker World::newBroker(const char* name) {
  auto& table = brokerTables_.emplace_back(std::make_unique<CMPIBrokerFT>());
  table->brokerVersion = CMPICurrentVersion;
  table->brokerName = name;
  table->enumerateInstances = enumerateInstances;
  CMPIBroker broker{};
  broker.bft = table.get();
  return broker;
}

CMPIEnumeration* World::newEnumeration(const Served& answer, const Path& path) {
  auto& enumeration = enumerations_.emplace_back(std::make_unique<Enumeration>());
  enumeration->cmpi = {enumeration.get(), &enumerationTable};
  enumeration->answer = answer;
  if (answer.narrows) {
    std::erase_if(enumeration->answer.instances,
                  [&](const Instance* instance) { return instance != nullptr && differs(*instance, path); });
  }
  return &enumeration->cmpi;
}

}  // namespace standin
