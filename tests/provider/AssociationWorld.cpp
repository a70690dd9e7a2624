#include "AssociationWorld.h"

#include <regex>

namespace associations {

namespace {

constexpr int nameId = 108;
constexpr int controllerType = 70;

std::string keyText(const char* className, const char* key, const std::string& value) {
  return std::string(className) + "." + key + "=" + value;
}

standin::Path* unwrap(const CMPIObjectPath* path) {
  return path != nullptr ? static_cast<standin::Path*>(path->hdl) : nullptr;
}

const standin::Instance* unwrap(const CMPIInstance* instance) {
  return instance != nullptr ? static_cast<standin::Instance*>(instance->hdl) : nullptr;
}

}  // namespace

void setUpMachine(standin::World& world) {
  world.nodes = {
      {40, "c0", "", "c0", "Computer System", {{nameId, "alpha"}}, {}},
      {40, "c1", "", "c1", "Computer System", {{nameId, "beta"}}, {}},
      {3, "f1", "c0", "c0", "BIOS", {}, {}},
      {controllerType, "e0", "c0", "c0", "Management Controller", {}, {}},
      {3, "f2", "e0", "c0", "BMC Firmware", {}, {}},
      {49, "1a", "c0", "c0", "Network Device", {}, {}},
      {12, "5a", "1a", "c0", "Network Port", {{nameId, "eth0"}}, {}},
      {12, "5b", "1a", "c0", "Network Port", {{nameId, "eth1"}}, {}},
      {3, "f3", "1a", "c0", "Network Firmware", {}, {}},
      {3, "f4", "1a", "c0", "Network Boot ROM", {}, {}},
      {49, "1b", "c0", "c0", "Network Device", {}, {}},
      {12, "5c", "1b", "c0", "Network Port", {{nameId, "eth2"}}, {}},
      {3, "f5", "1b", "c0", "Network Firmware", {}, {}},
      {44, "d1", "c0", "c0", "driver of alpha", {}, {}},
      {44, "d2", "c1", "c1", "driver of beta", {}, {}},
  };
  serveInstances(world, "KELVO_ComputerSystem", "Name", {"alpha", "beta"});
  serveInstances(world, "KELVO_SPComputerSystem", "Name", {"alpha"});
  serveInstances(world, "KELVO_NetworkPort", "DeviceID", {"eth0", "eth1", "eth2"});
}

CMPIObjectPath* path(const char* className, const Keys& keys, const References& references) {
  standin::Path* made = standin::world().newPath(className);
  made->keys = keys;
  for (const auto& [name, reference] : references) {
    made->references.emplace_back(name, unwrap(reference));
  }
  return &made->cmpi;
}

CMPIObjectPath* software(const std::string& instanceId) {
  return path("KELVO_SoftwareIdentity", {{"InstanceID", instanceId}});
}
CMPIObjectPath* computer(const std::string& name) {
  return path("KELVO_ComputerSystem", {{"Name", name}});
}
CMPIObjectPath* serviceProcessor(const std::string& name) {
  return path("KELVO_SPComputerSystem", {{"Name", name}});
}
CMPIObjectPath* port(const std::string& deviceId) {
  return path("KELVO_NetworkPort", {{"DeviceID", deviceId}});
}

std::string softwareText(const std::string& instanceId) {
  return keyText("KELVO_SoftwareIdentity", "InstanceID", instanceId);
}
std::string computerText(const std::string& name) {
  return keyText("KELVO_ComputerSystem", "Name", name);
}
std::string serviceProcessorText(const std::string& name) {
  return keyText("KELVO_SPComputerSystem", "Name", name);
}
std::string portText(const std::string& deviceId) {
  return keyText("KELVO_NetworkPort", "DeviceID", deviceId);
}

std::vector<std::string> allSoftwareTexts() {
  std::vector<std::string> texts;
  for (const std::string& id : {bios, bmc, nicFirmware, nicBootRom, otherNicFirmware, driver, betaDriver}) {
    texts.push_back(softwareText(id));
  }
  return texts;
}

std::string textOf(const CMPIObjectPath* path) {
  return standin::describe(unwrap(path));
}

std::string textOf(const CMPIInstance* instance) {
  return instance != nullptr ? standin::describe(unwrap(instance)->path) : "(null)";
}

std::string propertyOf(const CMPIInstance* instance, const std::string& name) {
  if (instance == nullptr) {
    return "(no instance)";
  }
  for (const auto& [property, value] : unwrap(instance)->properties) {
    if (property == name) {
      return value;
    }
  }
  return "(unset)";
}

Oru::Moniker moniker(const Keys& keys) {
  Oru::Moniker made;
  for (const auto& [name, value] : keys) {
    made.addKey(name, value);
  }
  return made;
}

std::string textOf(Oru::Moniker moniker) {
  std::string text;
  for (unsigned int i = 0; i < moniker.getKeyCount(); ++i) {
    std::string name;
    std::string value;
    if (moniker.selectKey(i) && moniker.getName(name) && moniker.getValue(value)) {
      text.append(text.empty() ? "" : ",").append(name).append("=").append(value);
    }
  }
  return text;
}

standin::Node& nodeOf(standin::World& world, const std::string& text) {
  for (standin::Node& candidate : world.nodes) {
    if (candidate.text == text) {
      return candidate;
    }
  }
  ADD_FAILURE() << "no node " << text;
  return world.nodes.front();
}

void serveInstances(standin::World& world, const char* className, const char* key,
                    const std::vector<std::string>& values) {
  standin::Served answer;
  for (const std::string& value : values) {
    answer.instances.push_back(world.newInstance(className, {{key, value}}));
  }
  world.served[className] = answer;
}

std::size_t countOf(const std::vector<std::string>& calls, const std::string& call) {
  std::size_t count = 0;
  for (const std::string& made : calls) {
    count += made == call || made.rfind(call + "(", 0) == 0 ? 1 : 0;
  }
  return count;
}

std::size_t entriesOf(const standin::World& world, const std::string& function, const std::string& file) {
  std::size_t count = 0;
  for (const standin::LogLine& line : world.log) {
    const bool isEntry = !line.trace && line.text.rfind("ENTERING", 0) == 0;
    count += isEntry && line.function == function && line.file == file ? 1 : 0;
  }
  return count;
}

std::vector<std::string> logTexts(const standin::World& world, int level, bool trace) {
  static const std::regex lineNumber("(Line:|line) [0-9]+");
  std::vector<std::string> texts;
  for (const standin::LogLine& line : world.log) {
    if (line.level == level && line.trace == trace) {
      texts.push_back(std::regex_replace(line.text, lineNumber, "$1 N"));
    }
  }
  return texts;
}

}  // namespace associations
