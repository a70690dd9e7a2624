// Carries requests to the providers, from clients and from other providers alike, and applies the rules of
// the answers.
//
// Threads: requests may come from several at once.
#pragma once

#include <cimom/Associations.h>
#include <cimom/Changes.h>
#include <cimom/DeclaredAnswers.h>
#include <cimom/Outcome.h>
#include <cimom/ProviderCall.h>
#include <cimom/Routes.h>
#include <cimom/broker/Broker.h>
#include <cimom/broker/Objects.h>
#include <cimom/broker/Result.h>
#include <cmpi/cmpidt.h>

#include <string>
#include <utility>

namespace cimom {

class Dispatcher final : public UpcallTarget {
 public:
  explicit Dispatcher(Log log)
      : diagnostics_(std::move(log)), associations_(*this), changes_(*this), declared_(*this) {}

  /// Called once, before the first request: the routes need the broker, which needs this.
  void setRoutes(const Routes& routes) { routes_ = &routes; }

  /// Asks the provider of the class and those of all classes below it, each with its own class name. A
  /// provider that fails does not keep the others from being asked; the first failure is the outcome.
  Outcome enumerate(Kind kind, const Asked& asked, ResultSink& sink) const;

  /// CMPI_RC_ERR_INVALID_PARAMETER where the keys do not fit the class, CMPI_RC_ERR_NOT_FOUND for every
  /// answer but exactly the instance asked for.
  Outcome get(const Asked& asked, ResultSink& sink) const;

  [[nodiscard]] const Associations& associations() const { return associations_; }
  [[nodiscard]] const Changes& changes() const { return changes_; }
  [[nodiscard]] const DeclaredAnswers& declared() const { return declared_; }

  /// CMPI_RC_ERR_INVALID_NAMESPACE or CMPI_RC_ERR_INVALID_CLASS for a path whose namespace or class nobody
  /// knows, CMPI_RC_ERR_FAILED where providers ask each other too deep.
  [[nodiscard]] Status check(const ObjectPath& path) const;
  /// The same for a path whose class does not count.
  [[nodiscard]] Status checkNameSpace(const ObjectPath& path) const;

  [[nodiscard]] const Routes& routes() const { return *routes_; }
  [[nodiscard]] const Diagnostics& diagnostics() const { return diagnostics_; }

  UpcallStatus enumerateInstances(const Context& context, const ObjectPath& path, const char** properties,
                                  ResultSink& sink) override;
  UpcallStatus enumerateInstanceNames(const Context& context, const ObjectPath& path,
                                      ResultSink& sink) override;
  UpcallStatus getInstance(const Context& context, const ObjectPath& path, const char** properties,
                           ResultSink& sink) override;
  UpcallStatus associators(const Context& context, const ObjectPath& path, const AssociationFilter& filter,
                           const char** properties, ResultSink& sink) override;
  UpcallStatus associatorNames(const Context& context, const ObjectPath& path,
                               const AssociationFilter& filter, ResultSink& sink) override;
  UpcallStatus references(const Context& context, const ObjectPath& path, const AssociationFilter& filter,
                          const char** properties, ResultSink& sink) override;
  UpcallStatus referenceNames(const Context& context, const ObjectPath& path, const AssociationFilter& filter,
                              ResultSink& sink) override;
  UpcallStatus createInstance(const Context& context, const ObjectPath& path, const Instance& instance,
                              ResultSink& sink) override;
  UpcallStatus modifyInstance(const Context& context, const ObjectPath& path, const Instance& instance,
                              const char** properties) override;
  UpcallStatus deleteInstance(const Context& context, const ObjectPath& path) override;
  UpcallStatus execQuery(const Context& context, const ObjectPath& path, std::string_view query,
                         std::string_view language, ResultSink& sink) override;

 private:
  Outcome getFrom(const Asked& asked, const Route& route, ResultSink& sink) const;
  Outcome ask(const Asked& asked, const Route& route, ResultSink& answer) const;

  Diagnostics diagnostics_;
  const Routes* routes_ = nullptr;
  Associations associations_;
  Changes changes_;
  DeclaredAnswers declared_;
};

}  // namespace cimom
