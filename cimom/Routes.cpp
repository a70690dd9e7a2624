#include <cimom/Names.h>
#include <cimom/Routes.h>

#include <algorithm>

namespace cimom {

Routes::Routes(const ClassRepository& schema, const Broker& broker,
               const std::vector<ProviderRegistration>& registrations,
               const std::filesystem::path& providerFolder, const std::function<void(std::string_view)>& log)
    : schema_(schema), classes_(broker.classes()) {
  for (const ProviderRegistration& each : registrations) {
    const ClassInfo* info = classes_.find(each.className);
    if (info == nullptr)
      throw RegistrationError(each.where + ": registered class " + each.className + " is not in the schema");
    ProviderLibrary& serving = library(each, broker, providerFolder, log);
    for (const std::string& nameSpace : each.nameSpaces) {
      auto found = std::find_if(nameSpaces_.begin(), nameSpaces_.end(),
                                [&nameSpace](const auto& known) { return sameName(known.first, nameSpace); });
      if (found == nameSpaces_.end())
        found = nameSpaces_.emplace(nameSpaces_.end(), nameSpace, ByClass());
      if (!found->second.emplace(info, Route{info, each.instance, each.association, &serving}).second)
        throw RegistrationError(each.where + ": class " + each.className + " is registered twice in " +
                                nameSpace);
    }
  }
}

ProviderLibrary& Routes::library(const ProviderRegistration& registration, const Broker& broker,
                                 const std::filesystem::path& folder,
                                 const std::function<void(std::string_view)>& log) {
  auto& slot = libraries_[{registration.location, registration.provider}];
  if (slot == nullptr) {
    // An absolute path: without a slash in it, dlopen would look in the system's folders.
    const std::filesystem::path given = registration.location;
    const auto file = given.is_absolute()
                          ? given
                          : std::filesystem::absolute(folder) / ("lib" + registration.location + ".so");
    slot = std::make_unique<ProviderLibrary>(file, registration.provider, broker, log);
  }
  return *slot;
}

const Routes::ByClass* Routes::inNameSpace(std::string_view nameSpace) const {
  const auto found = std::find_if(nameSpaces_.begin(), nameSpaces_.end(), [nameSpace](const auto& known) {
    return sameName(known.first, nameSpace);
  });
  return found == nameSpaces_.end() ? nullptr : &found->second;
}

bool Routes::knowsNameSpace(std::string_view nameSpace) const {
  return inNameSpace(nameSpace) != nullptr;
}

std::string_view Routes::defaultNameSpace(std::string_view className) const {
  const ClassInfo* info = classes_.find(className);
  for (const auto& [name, routes] : nameSpaces_) {
    if (routes.contains(info))
      return name;
  }
  return nameSpaces_.empty() ? std::string_view() : std::string_view(nameSpaces_.front().first);
}

const Route* Routes::find(std::string_view nameSpace, const ClassInfo& info) const {
  const ByClass* routes = inNameSpace(nameSpace);
  if (routes == nullptr)
    return nullptr;
  const auto found = routes->find(&info);
  return found == routes->end() ? nullptr : &found->second;
}

std::vector<const Route*> Routes::below(std::string_view nameSpace, const ClassInfo& top) const {
  std::vector<const Route*> result;
  for (const SchemaClass* each : ClassRepository::withSubclasses(*schema_.find(top.name()))) {
    const Route* route = find(nameSpace, *classes_.find(each->name()));
    if (route != nullptr)
      result.push_back(route);
  }
  return result;
}

const Route* Routes::responsible(std::string_view nameSpace, const ClassInfo& info) const {
  const Route* route = nullptr;
  for (const ClassInfo* each = &info; each != nullptr && route == nullptr; each = each->superClass())
    route = find(nameSpace, *each);
  return route;
}

}  // namespace cimom
