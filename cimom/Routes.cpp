#include <cimom/Names.h>
#include <cimom/Routes.h>

#include <algorithm>
#include <iterator>

namespace cimom {

Routes::Routes(const ClassRepository& schema, const Broker& broker,
               const std::vector<ProviderRegistration>& registrations,
               const std::filesystem::path& providerFolder, const std::function<void(std::string_view)>& log,
               const DeclaredInstances& declared, OtherName otherName)
    : schema_(schema), classes_(broker.classes()), declared_(declared), otherName_(std::move(otherName)) {
  for (const ProviderRegistration& each : registrations) {
    const ClassInfo* info = classes_.find(each.className);
    if (info == nullptr)
      throw RegistrationError(each.where + ": registered class " + each.className + " is not in the schema");
    ProviderLibrary& serving = library(each, broker, providerFolder, log);
    for (const std::string& nameSpace : each.nameSpaces) {
      const Route route{info,
                        schema_.find(info->name()),
                        each.instance,
                        each.association,
                        each.keepsNothing ? Recycling::OnReturn : Recycling::Off,
                        &serving};
      if (!makeNameSpace(nameSpace).byClass.emplace(info, route).second)
        throw RegistrationError(each.where + ": class " + each.className + " is registered twice in " +
                                nameSpace);
    }
  }
  for (const DeclaredInstance& each : declared_.all())
    add(each);
  listAssociations();
}

Routes::NameSpace& Routes::makeNameSpace(std::string_view nameSpace) {
  auto found = std::find_if(nameSpaces_.begin(), nameSpaces_.end(),
                            [&](const auto& known) { return isSameNameSpace(known.first, nameSpace); });
  if (found == nameSpaces_.end())
    found = nameSpaces_.emplace(nameSpaces_.end(), properName(nameSpace), NameSpace());
  return found->second;
}

void Routes::add(const DeclaredInstance& declared) {
  const ClassInfo* const info = &declared.classInfo();
  Route route;
  route.info = info;
  route.schema = schema_.find(info->name());
  route.instance = true;
  route.association = route.schema->isAssociation();
  NameSpace& own = makeNameSpace(declared.nameSpace());
  if (const auto [known, isNew] = own.byClass.emplace(info, route); !isNew && !known->second.isDeclared())
    throw RegistrationError("a provider is registered for class " + std::string(info->name()) + " in " +
                            std::string(declared.nameSpace()) + ", where instances of it are declared");
  route.instance = false;
  for (const NamedValue& property : declared.instance->properties()) {
    const ObjectPath* const end = objectPath(property.data);
    if (route.association && end != nullptr && !isSameNameSpace(end->nameSpace(), declared.nameSpace()))
      makeNameSpace(end->nameSpace()).foreign.emplace(info, route);
  }
}

void Routes::listAssociations() {
  for (auto& [name, space] : nameSpaces_) {
    for (const SchemaClass* each : schema_.all()) {
      const ClassInfo* const info = classes_.find(each->name());
      for (const auto* routes : {&space.byClass, &space.foreign}) {
        const auto found = routes->find(info);
        if (found != routes->end() && found->second.association && !each->isAbstract())
          space.associations.push_back(&found->second);
      }
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

const Routes::NameSpace* Routes::inNameSpace(std::string_view nameSpace) const {
  const auto found = std::find_if(nameSpaces_.begin(), nameSpaces_.end(),
                                  [&](const auto& known) { return isSameNameSpace(known.first, nameSpace); });
  return found == nameSpaces_.end() ? nullptr : &found->second;
}

bool Routes::knowsNameSpace(std::string_view nameSpace) const {
  return inNameSpace(nameSpace) != nullptr;
}

std::string_view Routes::properName(std::string_view nameSpace) const {
  const bool isOther = !otherName_.name.empty() && sameName(nameSpace, otherName_.name);
  return isOther ? std::string_view(otherName_.nameSpace) : nameSpace;
}

bool Routes::isSameNameSpace(std::string_view left, std::string_view right) const {
  return sameName(properName(left), properName(right));
}

std::vector<std::string> Routes::nameSpaces() const {
  std::vector<std::string> result;
  std::transform(nameSpaces_.begin(), nameSpaces_.end(), std::back_inserter(result),
                 [](const auto& each) { return each.first; });
  return result;
}

std::string_view Routes::defaultNameSpace(std::string_view className) const {
  const ClassInfo* info = classes_.find(className);
  for (const auto& [name, space] : nameSpaces_) {
    if (space.byClass.contains(info))
      return name;
  }
  return nameSpaces_.empty() ? std::string_view() : std::string_view(nameSpaces_.front().first);
}

const Route* Routes::find(std::string_view nameSpace, const ClassInfo& info) const {
  const NameSpace* space = inNameSpace(nameSpace);
  if (space == nullptr)
    return nullptr;
  const auto found = space->byClass.find(&info);
  return found == space->byClass.end() ? nullptr : &found->second;
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

std::vector<const Route*> Routes::associations(std::string_view nameSpace, const ClassInfo* top) const {
  std::vector<const Route*> result;
  if (const NameSpace* space = inNameSpace(nameSpace))
    std::copy_if(space->associations.begin(), space->associations.end(), std::back_inserter(result),
                 [top](const Route* route) { return top == nullptr || route->info->isA(*top); });
  return result;
}

const Route* Routes::responsible(std::string_view nameSpace, const ClassInfo& info,
                                 bool Route::*operation) const {
  for (const ClassInfo* each = &info; each != nullptr; each = each->superClass()) {
    const Route* route = find(nameSpace, *each);
    if (route != nullptr && route->*operation)
      return route;
  }
  return nullptr;
}

}  // namespace cimom
