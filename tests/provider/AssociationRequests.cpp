#include "AssociationRequests.h"

namespace associations {

namespace {

std::string pairText(const char* className, const std::string& first, const std::string& firstText,
                     const std::string& second, const std::string& secondText) {
  return std::string(className) + "." + first + "={" + firstText + "}," + second + "={" + secondText + "}";
}

}  // namespace

std::string installedText(const std::string& computerName, const std::string& instanceId) {
  return pairText(installedClass, "System", computerText(computerName), "InstalledSoftware",
                  softwareText(instanceId));
}
std::string bmcText(const std::string& computerName, const std::string& instanceId) {
  return pairText(bmcClass, "Antecedent", serviceProcessorText(computerName), "Dependent",
                  softwareText(instanceId));
}
std::string biosText(const std::string& computerName, const std::string& instanceId) {
  return pairText(biosClass, "Antecedent", computerText(computerName), "Dependent", softwareText(instanceId));
}
std::string networkText(const std::string& instanceId, const std::string& deviceId) {
  return pairText(networkClass, "Antecedent", softwareText(instanceId), "Dependent", portText(deviceId));
}

AssociationRequests::AssociationRequests() {
  setUpMachine(world);
  world.ancestors = {
      {"CIM_InstalledSoftwareIdentity", {"CIM_InstalledSoftwareIdentity"}},
      {"CIM_ElementSoftwareIdentity", {"CIM_ElementSoftwareIdentity"}},
      {"CIM_Both", {"CIM_InstalledSoftwareIdentity", "CIM_ElementSoftwareIdentity"}},
  };
}

Answer AssociationRequests::answer(CMPIStatus status) const {
  Answer made{status, world.done, {}, {}};
  for (const standin::Path* path : world.returnedPaths) {
    made.objects.push_back(standin::describe(path));
  }
  for (const standin::Instance* instance : world.returnedInstances) {
    made.objects.push_back(instance != nullptr ? standin::describe(instance->path) : "(null)");
  }
  for (const std::string& text : texts(3000)) {
    if (text.rfind("MESSAGE", 0) == 0) {
      made.failures.push_back(text.substr(text.find("]: ") + 3));
    }
  }
  return made;
}

Answer AssociationRequests::names(const CMPIObjectPath* source, const char* associationClass,
                                  const char* resultClass) {
  world.forget();
  return answer(associations->ft->associatorNames(associations, nullptr, world.result(), source,
                                                  associationClass, resultClass, nullptr, nullptr));
}

Answer AssociationRequests::associators(const CMPIObjectPath* source, const char* associationClass,
                                        const char** properties) {
  world.forget();
  return answer(associations->ft->associators(associations, nullptr, world.result(), source, associationClass,
                                              nullptr, nullptr, nullptr, properties));
}

Answer AssociationRequests::enumerateNames(const CMPIObjectPath* path) {
  world.forget();
  return answer(enumInstanceNames(path));
}

Answer AssociationRequests::enumerate(const CMPIObjectPath* path, const char** properties) {
  world.forget();
  return answer(enumInstances(path, properties));
}

Answer AssociationRequests::get(const CMPIObjectPath* path, const char** properties) {
  world.forget();
  return answer(getInstance(path, properties));
}

standin::Node& AssociationRequests::node(const std::string& text) {
  return nodeOf(world, text);
}

void AssociationRequests::serve(const char* className, const char* key,
                                const std::vector<std::string>& values) {
  serveInstances(world, className, key, values);
}

void AssociationRequests::useBroker(const char* name) {
  broker = world.newBroker(name);
  providerAccess().createInstanceMI(&broker, nullptr, nullptr);
  providerAccess().createAssociationMI(&broker, nullptr, nullptr);
}

}  // namespace associations
