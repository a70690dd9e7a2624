// CMPI helpers and logger over the scripted world.
#include <Oru/ProviderUtilities.h>
#include <ZelLog/ZelLogger.h>
#include <ZelLog/ZelMessageBuffer.h>

#include <mutex>
#include <sstream>

#include "StandIn.h"

namespace Oru {

namespace {

using standin::world;

standin::Path* unwrap(const CMPIObjectPath* path) {
  return path != nullptr ? static_cast<standin::Path*>(path->hdl) : nullptr;
}

std::string callOf(const char* operation, const char* name) {
  return std::string(operation) + "(" + (name != nullptr ? name : "null") + ")";
}

std::string callOf(const char* operation, const char* name, const char* argument) {
  return std::string(operation) + "(" + name + "," + argument + ")";
}

std::string describe(CMPIObjectPath* path) {
  return standin::describe(unwrap(path));
}

void set(CMPIInstance* instance, const char* name, std::string value) {
  if (!world().record(callOf("setProperty", name), false) && instance != nullptr) {
    static_cast<standin::Instance*>(instance->hdl)->properties.emplace_back(name, std::move(value));
  }
}

std::string textOf(const std::string& value) {
  return value;
}
std::string textOf(unsigned short value) {
  return std::to_string(value);
}

template <typename Element>
std::string listOf(const std::vector<Element>& values) {
  std::string list;
  for (const Element& value : values) {
    list += (list.empty() ? "" : ",") + textOf(value);
  }
  return "[" + list + "]";
}

}  // namespace

unsigned short ProviderUtilities::getClassId(const CMPIObjectPath* path) {
  const bool fails = world().record("getClassId(path)", false);
  const auto found =
      path != nullptr ? world().classIds.find(unwrap(path)->className) : world().classIds.end();
  return fails || found == world().classIds.end() ? 255 : found->second;
}

unsigned short ProviderUtilities::getClassId(const char* className) {
  const bool fails = world().record(callOf("getClassId", className), false);
  const auto found = className != nullptr ? world().classIds.find(className) : world().classIds.end();
  return fails || found == world().classIds.end() ? 255 : found->second;
}

bool ProviderUtilities::areClassesRelated(const CMPIBroker* broker, const std::string& nameSpace,
                                          const char* className, const char* otherClassName) {
  world().brokersUsed.push_back(broker);
  if (world().record(callOf("areClassesRelated", otherClassName) + " in " + nameSpace, false)) {
    return false;
  }
  if (className == nullptr) {
    return true;
  }
  for (const std::string& ancestor : world().ancestors[className]) {
    if (ancestor == otherClassName) {
      return true;
    }
  }
  return false;
}

std::string ProviderUtilities::getNamespace(const CMPIObjectPath* path) {
  const bool fails = world().record("getNamespace", false);
  return fails || path == nullptr ? "" : unwrap(path)->nameSpace;
}

unsigned short ProviderUtilities::getKeyCount(const CMPIObjectPath* path) {
  const bool fails = world().record("getKeyCount", false);
  return fails || path == nullptr
             ? 0
             : static_cast<unsigned short>(unwrap(path)->keys.size() + unwrap(path)->references.size());
}

bool ProviderUtilities::getKeyProperty(const CMPIObjectPath* path, const char* name, std::string& value) {
  if (world().record(callOf("getKeyProperty", name), false) || path == nullptr) {
    return false;
  }
  for (const auto& [key, keyValue] : unwrap(path)->keys) {
    if (key == name) {
      value = keyValue;
      return true;
    }
  }
  return false;
}

bool ProviderUtilities::getKeyProperty(const CMPIObjectPath* path, const char* name, CMPIObjectPath** value) {
  if (world().record(callOf("getKeyProperty", name, "reference"), false) || path == nullptr) {
    return false;
  }
  for (const auto& [key, reference] : unwrap(path)->references) {
    if (key == name && reference != nullptr) {
      *value = &reference->cmpi;
      return true;
    }
  }
  return false;
}

void ProviderUtilities::setKeyProperty(CMPIObjectPath* path, const char* name, const std::string& value) {
  if (!world().record(callOf("setKeyProperty", name), false) && path != nullptr) {
    unwrap(path)->keys.emplace_back(name, value);
  }
}

void ProviderUtilities::setKeyProperty(CMPIObjectPath* path, const char* name, CMPIObjectPath* value) {
  if (!world().record(callOf("setKeyProperty", name, describe(value).c_str()), false) && path != nullptr) {
    unwrap(path)->references.emplace_back(name, unwrap(value));
  }
}

CMPIObjectPath* ProviderUtilities::createObjectPath(const CMPIBroker* broker, const char* className,
                                                    std::string nameSpace) {
  world().brokersUsed.push_back(broker);
  const bool fails = world().record(callOf("createObjectPath", className), false);
  return fails ? nullptr : &world().newPath(className, std::move(nameSpace))->cmpi;
}

CMPIInstance* ProviderUtilities::createInstance(const CMPIBroker* broker, CMPIObjectPath* path) {
  world().brokersUsed.push_back(broker);
  const bool fails = world().record("createInstance", false);
  return fails || path == nullptr ? nullptr : &world().newInstance(unwrap(path))->cmpi;
}

bool ProviderUtilities::getProperty(const CMPIInstance* instance, const char* name, std::string& value,
                                    bool flag) {
  const bool fails = world().record(callOf("getProperty", name, flag ? "true" : "false"), false);
  if (fails || instance == nullptr || instance->hdl == nullptr) {
    return false;
  }
  for (const auto& [property, its] : static_cast<standin::Instance*>(instance->hdl)->properties) {
    if (property == name) {
      value = its;
      return true;
    }
  }
  return false;
}

void ProviderUtilities::setProperty(CMPIInstance* instance, const char* name, std::string& value) {
  set(instance, name, value);
}
void ProviderUtilities::setProperty(CMPIInstance* instance, const char* name, unsigned short value) {
  set(instance, name, std::to_string(value));
}
void ProviderUtilities::setProperty(CMPIInstance* instance, const char* name, bool value) {
  set(instance, name, value ? "true" : "false");
}
void ProviderUtilities::setProperty(CMPIInstance* instance, const char* name, CMPIObjectPath* value) {
  set(instance, name, describe(value));
}
void ProviderUtilities::setProperty(const CMPIBroker* broker, CMPIInstance* instance, const char* name,
                                    std::string& value, bool isDateTime) {
  world().brokersUsed.push_back(broker);
  set(instance, name, (isDateTime ? "datetime:" : "") + value);
}
void ProviderUtilities::setProperty(const CMPIBroker* broker, CMPIInstance* instance, const char* name,
                                    std::vector<unsigned short>& values) {
  world().brokersUsed.push_back(broker);
  set(instance, name, listOf(values));
}
void ProviderUtilities::setProperty(const CMPIBroker* broker, CMPIInstance* instance, const char* name,
                                    std::vector<std::string>& values) {
  world().brokersUsed.push_back(broker);
  set(instance, name, listOf(values));
}
void ProviderUtilities::transformObjectPathToMoniker(const CMPIObjectPath* path, Moniker& moniker) {
  if (world().record("transformObjectPathToMoniker", false) || path == nullptr) {
    return;
  }
  for (const auto& [name, value] : unwrap(path)->keys) {
    moniker.addKey(name, value);
  }
}
void ProviderUtilities::transformMonikerToObjectPath(Moniker& moniker, CMPIObjectPath** path) {
  if (world().record("transformMonikerToObjectPath", false) || *path == nullptr) {
    return;
  }
  for (unsigned int i = 0; i < moniker.getKeyCount(); ++i) {
    auto& [name, value] = unwrap(*path)->keys.emplace_back();
    if (!moniker.selectKey(i) || !moniker.getName(name) || !moniker.getValue(value)) {
      unwrap(*path)->keys.pop_back();
    }
  }
}

}  // namespace Oru

namespace ZelLog {

ZelMessageBuffer::ZelMessageBuffer() : state_(new std::ostringstream) {}
ZelMessageBuffer::~ZelMessageBuffer() {
  delete static_cast<std::ostringstream*>(state_);
}
ZelMessageBuffer& ZelMessageBuffer::operator<<(const char* text) {
  *static_cast<std::ostringstream*>(state_) << text;
  return *this;
}
ZelMessageBuffer& ZelMessageBuffer::operator<<(const std::string& text) {
  return *this << text.c_str();
}
ZelMessageBuffer::operator std::ostream&() {
  return *static_cast<std::ostringstream*>(state_);
}
std::string str(ZelMessageBuffer& buffer) {
  return static_cast<std::ostringstream*>(buffer.state_)->str();
}
std::string str(std::ostream& stream) {
  return dynamic_cast<std::ostringstream&>(stream).str();
}

namespace {

std::mutex logMutex;

void append(bool trace, const char* function, const char* file, unsigned int line,
            const std::string& category, int level, bool reservedArgumentsEmpty, const std::string& message) {
  const std::lock_guard lock(logMutex);
  standin::world().log.push_back(
      {trace, function, file, line, category, level, message, reservedArgumentsEmpty});
}

}  // namespace

void ZelLogger::logLevelMessage(const char* function, const char* file, unsigned int line,
                                const std::string& category, int level, const char* reserved, int reserved1,
                                int reserved2, const std::string& message) {
  append(false, function, file, line, category, level,
         reserved == nullptr && reserved1 == 0 && reserved2 == 0, message);
}

void ZelLogger::traceLevelMessage(const char* function, const char* file, unsigned int line,
                                  const std::string& category, int level, const char* reserved, int reserved1,
                                  int reserved2, const std::string& message) {
  append(true, function, file, line, category, level, reserved == nullptr && reserved1 == 0 && reserved2 == 0,
         message);
}

#ifndef STANDIN_WITHOUT_LEVEL_TEST
bool ZelLogger::isLevelOn(ZelChannel channel, int level) {
  const bool routine = channel == ZelChannel::Log ? standin::world().logOn : standin::world().traceOn;
  return level <= 3000 || routine;
}
#endif

}  // namespace ZelLog
