// The association operations: which providers are asked, and what their answers are narrowed by.
//
// Threads: requests may come from several at once.
#pragma once

#include <cimom/AssociationDelivery.h>
#include <cimom/ProviderCall.h>
#include <cimom/Roles.h>
#include <cimom/broker/Broker.h>

#include <unordered_map>
#include <vector>

namespace cimom {

class Dispatcher;

class Associations {
 public:
  /// The dispatcher owns this.
  explicit Associations(const Dispatcher& dispatcher) : dispatcher_(dispatcher) {}

  /// As `ObjectManager` has them; where a provider asks, the source may also be a class: a path without keys.
  /// Result class and roles are handed on to the providers, and applied to whatever they answer.
  Outcome associators(Kind kind, const Asked& asked, const AssociationFilter& filter, ResultSink& sink) const;
  Outcome references(Kind kind, const Asked& asked, const AssociationFilter& filter, ResultSink& sink) const;

 private:
  /// A request that was found to make sense.
  struct Query {
    AssociationFilter filter;  ///< without empty texts
    const ClassInfo* resultClass = nullptr;
    std::vector<const Route*> routes;
  };
  using RolesByRoute = std::unordered_map<const Route*, Roles>;

  Status resolve(const Asked& asked, const AssociationFilter& filter, Query& query) const;
  [[nodiscard]] Status checkSource(const Asked& asked) const;
  /// Drops the routes of the classes in which the roles asked for cannot be played. Answers with the roles of
  /// the others.
  RolesByRoute narrowByRoles(const Asked& asked, Query& query) const;
  [[nodiscard]] Roles roles(const Route& route, const Asked& asked) const;

  const Dispatcher& dispatcher_;
  mutable RoleBook book_;
};

}  // namespace cimom
