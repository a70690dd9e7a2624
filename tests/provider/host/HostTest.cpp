#include "HostTest.h"

namespace {

std::string textOf(const std::map<std::string, std::string>& values) {
  std::string text;
  for (const auto& [name, value] : values) {
    text += " " + name + "=" + value;
  }
  return text;
}

std::string textOf(const std::string& what, const host::Answer& answer) {
  std::string text = what + ": status " + std::to_string(answer.status) + ", done " +
                     std::to_string(answer.done) + ", nulls " + std::to_string(answer.nulls);
  for (const host::Object& object : answer.objects) {
    text += "\n  " + object.path + textOf(object.keys) + " |" + textOf(object.properties);
  }
  return text;
}

}  // namespace

const CMPIBroker* HostTest::prepared(const tests::HostileCmpi& cmpi) {
  host::useInventory(INVENTORY_FILE);
  return cmpi.broker();
}

const cimom::ClassRepository& HostTest::schema() {
  static const cimom::ClassRepository classes = compiledSchema();
  return classes;
}

void HostTest::countKeysOfClasses() {
  for (const char* className : classes) {
    for (const cimom::mof::Property* key : schema().find(className)->keys()) {
      cmpi.countedKeys[className].push_back(key->name);
    }
  }
}

std::optional<CMPIType> HostTest::declaredType(const std::string& className, const std::string& property) {
  const cimom::SchemaClass* declared = schema().find(className);
  const cimom::mof::Property* found = declared == nullptr ? nullptr : declared->property(property);
  return found == nullptr ? std::nullopt : std::optional(found->type);
}

std::vector<std::string> HostTest::everything() {
  std::vector<std::string> texts;
  for (const char* className : classes) {
    const std::string name = className;
    texts.push_back(textOf(name + " names", providers.enumerateNames(path(className))));
    texts.push_back(textOf(name, providers.enumerate(path(className))));
  }
  for (const char* id : {"192@f1", "192@f2", "26@f4", "27@f5", "192@d1", "193@d2", "1@none"}) {
    texts.push_back(textOf(id, providers.get(softwareOf(id))));
    for (const char* association : associationClasses) {
      texts.push_back(textOf(id + std::string(association), providers.names(softwareOf(id), association)));
      texts.push_back(
          textOf(id + std::string(association), providers.associators(softwareOf(id), association)));
    }
  }
  for (const char* className : {host::computers, host::controllers}) {
    for (const char* name : {"alpha", "beta", "none"}) {
      const CMPIObjectPath* source = computer(className, name);
      texts.push_back(textOf(name, providers.get(source)));
      for (const char* association : associationClasses) {
        texts.push_back(textOf(name + std::string(association), providers.associators(source, association)));
      }
    }
  }
  texts.push_back(textOf(
      "port", providers.associators(path(host::ports, {{"DeviceID", "0000:17:00.1"}}), host::network)));
  return texts;
}
