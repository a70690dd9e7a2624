#include <cimom/Dispatcher.h>
#include <cimom/KeyCheck.h>
#include <cimom/broker/Context.h>
#include <cimom/broker/Request.h>
#include <cimom/broker/WbemUri.h>

#include <exception>

namespace cimom {

namespace {

/// Counts how many calls into providers stand on the calling thread's stack.
class Nesting {
 public:
  Nesting() { ++depth; }
  ~Nesting() { --depth; }
  Nesting(const Nesting&) = delete;
  Nesting& operator=(const Nesting&) = delete;

  [[nodiscard]] static bool isTooDeep() { return depth > Dispatcher::deepestNesting; }

 private:
  static thread_local int depth;
};

thread_local int Nesting::depth = 0;

/// One call into a provider: its request with all the memory, its context and its result.
class ProviderCall {
 public:
  ProviderCall(const Asked& asked, const ClassInfo& info, CMPIFlags flags, ResultSink& sink)
      : scope_(&request_), result_(sink, request_) {
    Arena& held = request_.held();
    if (asked.context == nullptr) {
      context_ = Context::create(held);
      context_->setFlags(flags);
    } else {
      context_ = asked.context->copyTo(held);
    }
    context_->setText(CMPIInitNameSpace, asked.path.nameSpace());
    path_ = asked.path.copyTo(held);
    path_->setClassName(info.name());
  }

  /// Makes the call. The provider's exceptions, which CMPI does not know, are a failure of the request.
  template <class Operation>
  Status run(const Operation& operation) {
    CMPIStatus status{CMPI_RC_OK, nullptr};
    try {
      status = operation(context_, &result_, path_);
    } catch (const std::exception& thrown) {
      return {CMPI_RC_ERR_FAILED, std::string("the provider threw an exception: ") + thrown.what()};
    }
    const String* message = String::from(status.msg);
    return {status.rc, message == nullptr ? std::string() : std::string(message->view())};
  }

  [[nodiscard]] const Result& result() const { return result_; }

 private:
  Request request_;
  RequestScope scope_;
  Context* context_ = nullptr;
  ObjectPath* path_ = nullptr;
  Result result_;
};

Status notSupported(std::string what) {
  return {CMPI_RC_ERR_NOT_SUPPORTED, std::move(what)};
}

std::string named(const Route& route) {
  return "provider " + route.library->provider();
}

}  // namespace

void Dispatcher::report(const std::string& line) const {
  if (log_)
    log_(line);
}

Status Dispatcher::check(const ObjectPath& path) const {
  if (!routes_->knowsNameSpace(path.nameSpace()))
    return {CMPI_RC_ERR_INVALID_NAMESPACE,
            "no class is registered in namespace '" + std::string(path.nameSpace()) + "'"};
  if (path.classInfo() == nullptr)
    return {CMPI_RC_ERR_INVALID_CLASS, "the schema has no class " + std::string(path.className())};
  if (Nesting::isTooDeep())
    return {CMPI_RC_ERR_FAILED,
            "providers ask each other more than " + std::to_string(deepestNesting) + " calls deep"};
  return {};
}

Outcome Dispatcher::enumerate(Enumerated what, const Asked& asked, ResultSink& sink) const {
  const Nesting nesting;
  Outcome outcome{check(asked.path), false, 0};
  if (outcome.status.code != CMPI_RC_OK)
    return outcome;
  Delivery delivery(what, sink, asked.properties);
  bool anyRoute = false;
  outcome.done = true;
  for (const Route* route : routes_->below(asked.path.nameSpace(), *asked.path.classInfo())) {
    if (!route->instance || !delivery.isOpen())
      continue;
    anyRoute = true;
    const Outcome one = enumerateRoute(what, asked, *route, delivery);
    delivery.rethrow();
    outcome.done = outcome.done && one.done;
    if (outcome.status.code == CMPI_RC_OK)
      outcome.status = one.status;
  }
  outcome.delivered = delivery.delivered();
  if (!anyRoute)
    return {notSupported("no provider is registered for class " + std::string(asked.path.className())), false,
            0};
  return outcome;
}

Outcome Dispatcher::enumerateRoute(Enumerated what, const Asked& asked, const Route& route,
                                   Delivery& delivery) const {
  const std::string className(route.info->name());
  delivery.startRoute(*routes_, route, *asked.path.classInfo(), asked.path.nameSpace());
  ProviderCall call(asked, *route.info, CMPI_FLAG_DeepInheritance, delivery);
  Status status;
  try {
    CMPIInstanceMI& mi = route.library->instanceMI();
    const auto operation = [&](const CMPIContext* context, const CMPIResult* result,
                               const CMPIObjectPath* path) {
      return what == Enumerated::Instances
                 ? mi.ft->enumerateInstances(&mi, context, result, path, asked.properties)
                 : mi.ft->enumerateInstanceNames(&mi, context, result, path);
    };
    const bool has = what == Enumerated::Instances ? mi.ft->enumerateInstances != nullptr
                                                   : mi.ft->enumerateInstanceNames != nullptr;
    status = has ? call.run(operation) : notSupported(named(route) + " enumerates nothing");
  } catch (const ProviderError& error) {
    status = {CMPI_RC_ERR_FAILED, error.what()};
  }
  const Result& result = call.result();
  if (delivery.strangers() > 0)
    report(named(route) + " answered for class " + className + " with " +
           std::to_string(delivery.strangers()) + " objects that nobody asked for, the first of class " +
           delivery.strangersClass() + "; they are left out");
  if (result.refused() > 0)
    report(named(route) + " answered for class " + className + " with " + std::to_string(result.refused()) +
           " nulls or foreign objects, or after its done marker; they are left out");
  if (status.code == CMPI_RC_OK && !result.done())
    report(named(route) + " stopped early: for class " + className + " it sent " +
           std::to_string(result.delivered()) + " objects and no done marker");
  return {std::move(status), result.done(), result.delivered()};
}

Outcome Dispatcher::get(const Asked& asked, ResultSink& sink) const {
  const Nesting nesting;
  Status status = check(asked.path);
  if (status.code == CMPI_RC_OK)
    status = checkKeys(asked.path, *asked.path.classInfo());
  if (status.code != CMPI_RC_OK)
    return {std::move(status), false, 0};
  const Route* route = routes_->find(asked.path.nameSpace(), *asked.path.classInfo());
  if (route == nullptr || !route->instance)
    return {notSupported("no provider is registered for class " + std::string(asked.path.className())), false,
            0};
  return getFrom(asked, *route, sink);
}

Outcome Dispatcher::getFrom(const Asked& asked, const Route& route, ResultSink& sink) const {
  Arena arena;
  SingleAnswer answer(arena);
  ProviderCall call(asked, *route.info, 0, answer);
  Outcome outcome;
  try {
    CMPIInstanceMI& mi = route.library->instanceMI();
    if (mi.ft->getInstance == nullptr)
      return {notSupported(named(route) + " gets no instances"), false, 0};
    outcome.status =
        call.run([&](const CMPIContext* context, const CMPIResult* result, const CMPIObjectPath* path) {
          return mi.ft->getInstance(&mi, context, result, path, asked.properties);
        });
  } catch (const ProviderError& error) {
    outcome.status = {CMPI_RC_ERR_FAILED, error.what()};
  }
  outcome.done = call.result().done();
  if (outcome.status.code != CMPI_RC_OK)
    return outcome;

  std::string wrong;
  if (answer.count() == 0)
    wrong = outcome.done ? "no instance" : "no instance and no done marker";
  else if (answer.count() > 1)
    wrong = std::to_string(answer.count()) + " objects where one was asked for";
  else if (answer.first() == nullptr)
    wrong = "a path where an instance was asked for";
  else if (!samePath(answer.first()->path(), asked.path))
    wrong = "another instance than was asked for: " + formatWbemUri(answer.first()->path());
  if (!wrong.empty()) {
    report(named(route) + " answered for " + formatWbemUri(asked.path) + " with " + wrong);
    outcome.status = {CMPI_RC_ERR_NOT_FOUND, named(route) + " answered with " + wrong};
    return outcome;
  }
  if (!outcome.done)
    report(named(route) + " sent no done marker for " + formatWbemUri(asked.path));
  if (const auto names = propertyNames(asked.properties))
    answer.first()->restrictTo(*names);
  outcome.delivered = 1;
  sink.instance(*answer.first());
  return outcome;
}

UpcallStatus Dispatcher::enumerateInstances(const Context& context, const ObjectPath& path,
                                            const char** properties, ResultSink& sink) {
  return enumerate(Enumerated::Instances, {path, properties, &context}, sink).status;
}

UpcallStatus Dispatcher::enumerateInstanceNames(const Context& context, const ObjectPath& path,
                                                ResultSink& sink) {
  return enumerate(Enumerated::Names, {path, nullptr, &context}, sink).status;
}

UpcallStatus Dispatcher::getInstance(const Context& context, const ObjectPath& path, const char** properties,
                                     ResultSink& sink) {
  return get({path, properties, &context}, sink).status;
}

}  // namespace cimom
