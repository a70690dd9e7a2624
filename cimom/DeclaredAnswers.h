// Declared instances, served by the object manager itself as if a provider did.
//
// The ends of associations are got from whoever serves them at the time of the request.
//
// Threads: requests may come from several at once.
#pragma once

#include <cimom/DeclaredInstances.h>
#include <cimom/Delivery.h>
#include <cimom/Outcome.h>
#include <cimom/ProviderCall.h>
#include <cimom/Routes.h>
#include <cimom/broker/Broker.h>
#include <cimom/broker/Objects.h>

#include <functional>
#include <string_view>

namespace cimom {

class Dispatcher;

class DeclaredAnswers {
 public:
  /// The dispatcher owns this.
  explicit DeclaredAnswers(const Dispatcher& dispatcher) : dispatcher_(dispatcher) {}

  // Each for the class of the route alone, as a provider is asked; the request has been found to make sense.

  Outcome enumerate(Kind kind, const Asked& asked, const Route& route, ResultSink& sink) const;
  /// CMPI_RC_ERR_NOT_FOUND for what is not declared, or what an end is missing of.
  Status get(const Asked& asked, const Route& route, ResultSink& sink) const;
  Outcome associators(Kind kind, const Asked& asked, const Route& route, const AssociationFilter& filter,
                      ResultSink& sink) const;
  Outcome references(Kind kind, const Asked& asked, const Route& route, const char* role,
                     ResultSink& sink) const;

  /// Whether an association of the route's class may hold the source.
  [[nodiscard]] bool concern(const Route& route, const ObjectPath& source) const;

 private:
  struct Work;  ///< a request under way

  /// The first of its references that may hold the object in this role; null: none. No role is any.
  [[nodiscard]] const NamedValue* near(const DeclaredInstance& declared, const ObjectPath& object,
                                       const char* role) const;
  [[nodiscard]] bool mayHold(const NamedValue& reference, const ObjectPath& object) const;
  /// Whether the reference, which may hold the object, does: for a pattern that takes asking its provider.
  [[nodiscard]] bool holds(Work& work, const NamedValue& reference, const ObjectPath& object) const;
  [[nodiscard]] bool exists(Work& work, const ObjectPath& object) const;
  [[nodiscard]] bool isNamed(const DeclaredInstance& declared, const ObjectPath& path) const;

  void give(Work& work, const DeclaredInstance& declared) const;
  static void giveWith(Work& work, const DeclaredInstance& declared, const ObjectPath& end);
  void giveEnd(Work& work, const ObjectPath& end) const;

  const Dispatcher& dispatcher_;
};

}  // namespace cimom
