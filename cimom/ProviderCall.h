// One call into a provider: the request, its memory and its context, and what is said about its answer.
#pragma once

#include <cimom/Delivery.h>
#include <cimom/Diagnostics.h>
#include <cimom/Outcome.h>
#include <cimom/Routes.h>
#include <cimom/broker/Context.h>
#include <cimom/broker/Objects.h>
#include <cimom/broker/Request.h>
#include <cimom/broker/Result.h>
#include <cmpi/cmpidt.h>

#include <exception>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace cimom {

/// What is asked, and by whom.
struct Asked {
  /// The class, its namespace, and keys: all of them for one instance; those of an enumeration are handed on.
  const ObjectPath& path;
  const char** properties = nullptr;  ///< as CMPI has them: null, or names ended by a null
  const Context* context = nullptr;   ///< of the provider that asks; null for a client
};

/// Counts how many requests stand on the calling thread's stack, because providers ask each other.
class Nesting {
 public:
  /// Each level takes stack and holds a request open.
  static constexpr int deepest = 16;

  Nesting() { ++depth; }
  ~Nesting() { --depth; }
  Nesting(const Nesting&) = delete;
  Nesting& operator=(const Nesting&) = delete;

  /// CMPI_RC_ERR_FAILED beyond the deepest level.
  [[nodiscard]] static Status check();

 private:
  static thread_local int depth;
};

[[nodiscard]] Status notSupported(std::string what);

/// "provider NAME", for messages.
[[nodiscard]] std::string named(const Route& route);

class ProviderCall {
 public:
  /// A call to the provider of `route`, which is given the path that was asked with, with `className` in it.
  ProviderCall(const Route& route, const Asked& asked, std::string_view className, CMPIFlags flags,
               ResultSink& sink);

  /// Memory for further arguments: it lasts as long as the call.
  [[nodiscard]] Arena& arena() { return request_.held(); }

  /// Calls the function of the provider's MI table, with what every function takes first and then
  /// `arguments`. CMPI_RC_ERR_FAILED where the provider cannot be had or throws, which CMPI does not know;
  /// CMPI_RC_ERR_NOT_SUPPORTED where it has no such function; else its own status.
  template <class MI, class Table, class Function, class... Arguments>
  Status ask(MI& (ProviderLibrary::*mi)(), Function* Table::*member, const Arguments&... arguments) {
    try {
      MI& provider = (route_.library->*mi)();
      Function* const function = provider.ft->*member;
      if (function == nullptr)
        return notSupported(named(route_) + " has no function for this request");
      return run([&] { return function(&provider, context_, &result_, path_, arguments...); });
    } catch (const ProviderError& error) {
      return {CMPI_RC_ERR_FAILED, error.what()};
    }
  }

  [[nodiscard]] const Result& result() const { return result_; }

  /// The outcome of a call that ended with `status`. What was odd about the answer is said.
  [[nodiscard]] Outcome concluded(Status status, const Delivery& delivery,
                                  const Diagnostics& diagnostics) const;

 private:
  template <class Operation>
  static Status run(const Operation& operation) {
    try {
      const CMPIStatus status = operation();
      const String* message = String::from(status.msg);
      return {status.rc, message == nullptr ? std::string() : std::string(message->view())};
    } catch (const std::exception& thrown) {
      return {CMPI_RC_ERR_FAILED, std::string("the provider threw an exception: ") + thrown.what()};
    }
  }

  const Route& route_;
  Request request_;
  RequestScope scope_;
  Context* context_ = nullptr;
  ObjectPath* path_ = nullptr;
  Result result_;
};

/// Has each provider that concerns a request asked by `ask(route)`, which answers with its outcome, until the
/// delivery is closed. The first failure is the outcome.
template <class Ask>
Outcome askEach(const std::vector<const Route*>& routes, const Delivery& delivery, const Ask& ask) {
  Outcome outcome{{}, true, 0};
  for (const Route* route : routes) {
    if (!delivery.isOpen())
      break;
    Outcome one = ask(*route);
    delivery.rethrow();
    outcome.done = outcome.done && one.done;
    if (outcome.status.code == CMPI_RC_OK)
      outcome.status = std::move(one.status);
  }
  outcome.delivered = delivery.delivered();
  return outcome;
}

}  // namespace cimom
