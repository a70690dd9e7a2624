// Which class stands in which reference of an association.
#pragma once

#include <cimom/Routes.h>
#include <cimom/broker/ClassTable.h>
#include <cimom/broker/Objects.h>

#include <mutex>
#include <optional>
#include <string_view>
#include <unordered_map>
#include <vector>

namespace cimom {

/// The references of one association class. Providers deliver in them what their contract says, which need
/// not be what the schema declares: what is delivered goes first.
class Roles {
 public:
  /// As the class declares them.
  Roles(const Route& association, const ClassTable& classes);

  /// Takes over what stands in the references of a path that the provider has delivered.
  void learnFrom(const ObjectPath& association);

  [[nodiscard]] bool has(std::string_view role) const { return find(role) != nullptr; }

  /// Whether objects of this class stand in this role. A class that stands in any role by what was learned
  /// stands in no other; for one that stands in none the declaration counts. False for a null, which is a
  /// class that the schema lacks.
  [[nodiscard]] bool stands(const ClassInfo* info, std::string_view role) const;

 private:
  struct Role {
    std::string_view name;
    const ClassInfo* declared = nullptr;
    const ClassInfo* delivered = nullptr;  ///< null: not known
  };

  [[nodiscard]] const Role* find(std::string_view name) const;

  std::vector<Role> roles_;
};

/// What was learned, for the requests that follow: the classes that a provider delivers do not change while
/// it is loaded. Threads: several at once.
class RoleBook {
 public:
  [[nodiscard]] std::optional<Roles> find(const Route& association) const;
  void keep(const Route& association, const Roles& roles);

 private:
  mutable std::mutex mutex_;
  std::unordered_map<const Route*, Roles> learned_;
};

}  // namespace cimom
