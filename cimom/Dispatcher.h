// Carries requests to the providers, from clients and from other providers alike, and applies the rules of
// the answers.
//
// Threads: requests may come from several at once.
#pragma once

#include <cimom/Delivery.h>
#include <cimom/Outcome.h>
#include <cimom/Routes.h>
#include <cimom/broker/Broker.h>
#include <cimom/broker/Objects.h>
#include <cimom/broker/Result.h>
#include <cmpi/cmpidt.h>

#include <functional>
#include <string>
#include <string_view>

namespace cimom {

/// What is asked, and by whom.
struct Asked {
  /// The class, its namespace, and keys: all of them for one instance; those of an enumeration are handed on.
  const ObjectPath& path;
  const char** properties = nullptr;  ///< as CMPI has them: null, or names ended by a null
  const Context* context = nullptr;   ///< of the provider that asks; null for a client
};

class Dispatcher final : public UpcallTarget {
 public:
  /// How deep providers may ask each other: each level takes stack and holds a request open.
  static constexpr int deepestNesting = 16;

  /// `log` may be empty.
  explicit Dispatcher(std::function<void(std::string_view)> log) : log_(std::move(log)) {}

  /// Called once, before the first request: the routes need the broker, which needs this.
  void setRoutes(const Routes& routes) { routes_ = &routes; }

  /// Asks the provider of the class and those of all classes below it, each with its own class name. A
  /// provider that fails does not keep the others from being asked; the first failure is the outcome.
  Outcome enumerate(Enumerated what, const Asked& asked, ResultSink& sink) const;

  /// CMPI_RC_ERR_INVALID_PARAMETER where the keys do not fit the class, CMPI_RC_ERR_NOT_FOUND for every
  /// answer but exactly the instance asked for.
  Outcome get(const Asked& asked, ResultSink& sink) const;

  UpcallStatus enumerateInstances(const Context& context, const ObjectPath& path, const char** properties,
                                  ResultSink& sink) override;
  UpcallStatus enumerateInstanceNames(const Context& context, const ObjectPath& path,
                                      ResultSink& sink) override;
  UpcallStatus getInstance(const Context& context, const ObjectPath& path, const char** properties,
                           ResultSink& sink) override;

 private:
  [[nodiscard]] Status check(const ObjectPath& path) const;
  Outcome enumerateRoute(Enumerated what, const Asked& asked, const Route& route, Delivery& delivery) const;
  Outcome getFrom(const Asked& asked, const Route& route, ResultSink& sink) const;
  void report(const std::string& line) const;

  std::function<void(std::string_view)> log_;
  const Routes* routes_ = nullptr;
};

}  // namespace cimom
