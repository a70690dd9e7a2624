#include <cimom/Interop.h>

#include <unistd.h>

#include <array>
#include <cstdint>
#include <utility>

namespace cimom {

namespace {

std::string ownHostName() {
  std::array<char, 256> name{};
  // The last byte stays zero: a longer name comes without one.
  if (::gethostname(name.data(), name.size() - 1) != 0 || name.front() == '\0')
    return "localhost";
  return name.data();
}

mof::Value single(mof::Scalar scalar) {
  return {false, {std::move(scalar)}};
}

mof::InstanceDeclaration instanceOf(const std::string& className, const std::string& nameSpace) {
  mof::InstanceDeclaration result;
  result.nameSpace = nameSpace;
  result.className = className;
  result.file = "the object manager's own instances";
  return result;
}

}  // namespace

std::vector<mof::InstanceDeclaration> hostInstances(const InteropSettings& settings,
                                                    std::span<const std::string> nameSpaces) {
  constexpr const char* managerClass = "CIM_ObjectManager";
  constexpr const char* nameSpaceClass = "CIM_Namespace";
  const std::string system = settings.systemName.empty() ? ownHostName() : settings.systemName;
  const std::string name = settings.name.empty() ? "cimom:" + system : settings.name;
  const std::string description = settings.version.empty()
                                      ? settings.description
                                      : settings.description + " Version " + settings.version + ".";

  std::vector<mof::InstanceDeclaration> result;
  mof::InstanceDeclaration manager = instanceOf(managerClass, settings.nameSpace);
  constexpr std::int64_t isOk = 2;
  manager.values = {{"SystemCreationClassName", single(settings.systemClass)},
                    {"SystemName", single(system)},
                    {"CreationClassName", single(managerClass)},
                    {"Name", single(name)},
                    {"ElementName", single(settings.elementName)},
                    {"Description", single(description)},
                    {"OperationalStatus", {true, {isOk}}},
                    {"Started", single(true)}};
  result.push_back(std::move(manager));
  for (const std::string& each : nameSpaces) {
    mof::InstanceDeclaration one = instanceOf(nameSpaceClass, settings.nameSpace);
    one.values = {{"SystemCreationClassName", single(settings.systemClass)},
                  {"SystemName", single(system)},
                  {"ObjectManagerCreationClassName", single(managerClass)},
                  {"ObjectManagerName", single(name)},
                  {"CreationClassName", single(nameSpaceClass)},
                  {"Name", single(each)}};
    result.push_back(std::move(one));
  }
  return result;
}

}  // namespace cimom
