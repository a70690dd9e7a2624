#include <cimom/Names.h>
#include <cimom/Roles.h>

#include <algorithm>

namespace cimom {

Roles::Roles(const Route& association, const ClassTable& classes) {
  for (const mof::Property& each : association.schema->properties) {
    if (each.type == CMPI_ref)
      roles_.push_back({each.name, classes.find(each.referenceClass), nullptr});
  }
}

void Roles::learnFrom(const ObjectPath& association) {
  for (Role& role : roles_) {
    const NamedValue* key = association.find(role.name);
    const ObjectPath* end = key == nullptr ? nullptr : objectPath(key->data);
    if (end != nullptr)
      role.delivered = end->classInfo();
  }
}

const Roles::Role* Roles::find(std::string_view name) const {
  const auto found = std::find_if(roles_.begin(), roles_.end(),
                                  [name](const Role& role) { return sameName(role.name, name); });
  return found == roles_.end() ? nullptr : &*found;
}

bool Roles::stands(const ClassInfo* info, std::string_view role) const {
  const Role* asked = find(role);
  if (info == nullptr || asked == nullptr)
    return false;
  const auto isDelivered = [info](const Role& each) {
    return each.delivered != nullptr && info->isA(*each.delivered);
  };
  if (std::any_of(roles_.begin(), roles_.end(), isDelivered))
    return isDelivered(*asked);
  return asked->declared != nullptr && info->isA(*asked->declared);
}

std::optional<Roles> RoleBook::find(const Route& association) const {
  const std::scoped_lock lock(mutex_);
  const auto found = learned_.find(&association);
  return found == learned_.end() ? std::nullopt : std::optional(found->second);
}

void RoleBook::keep(const Route& association, const Roles& roles) {
  const std::scoped_lock lock(mutex_);
  learned_.emplace(&association, roles);
}

}  // namespace cimom
