#include <cimom/Dispatcher.h>
#include <cimom/KeyCheck.h>
#include <cimom/broker/WbemUri.h>

#include <algorithm>

namespace cimom {

Status Dispatcher::checkNameSpace(const ObjectPath& path) const {
  if (!routes_->knowsNameSpace(path.nameSpace()))
    return {CMPI_RC_ERR_INVALID_NAMESPACE,
            "no class is registered in namespace '" + std::string(path.nameSpace()) + "'"};
  return Nesting::check();
}

Status Dispatcher::check(const ObjectPath& path) const {
  Status status = checkNameSpace(path);
  if (status.code == CMPI_RC_OK && path.classInfo() == nullptr)
    return {CMPI_RC_ERR_INVALID_CLASS, "the schema has no class " + std::string(path.className())};
  return status;
}

Outcome Dispatcher::enumerate(Kind kind, const Asked& asked, ResultSink& sink) const {
  const Nesting nesting;
  if (Status status = check(asked.path); status.code != CMPI_RC_OK)
    return {std::move(status), false, 0};
  const ObjectPath& path = asked.path;
  auto routes = routes_->below(path.nameSpace(), *path.classInfo());
  std::erase_if(routes, [](const Route* route) { return !route->instance; });
  if (routes.empty())
    return {notSupported("no provider is registered for class " + std::string(path.className())), false, 0};
  EnumerationDelivery delivery(kind, sink, asked.properties);
  return askEach(routes, delivery, [&](const Route& route) {
    delivery.startRoute(*routes_, route, *path.classInfo(), path.nameSpace());
    if (route.isDeclared())
      return declared_.enumerate(kind, asked, route, delivery);
    ProviderCall call(route, asked, route.info->name(), CMPI_FLAG_DeepInheritance, delivery);
    Status status =
        kind == Kind::Instances
            ? call.ask(&ProviderLibrary::instanceMI, &CMPIInstanceMIFT::enumerateInstances, asked.properties)
            : call.ask(&ProviderLibrary::instanceMI, &CMPIInstanceMIFT::enumerateInstanceNames);
    return call.concluded(std::move(status), delivery, diagnostics_);
  });
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

Outcome Dispatcher::ask(const Asked& asked, const Route& route, ResultSink& answer) const {
  if (route.isDeclared())
    return {declared_.get(asked, route, answer), true, 0};
  ProviderCall call(route, asked, route.info->name(), 0, answer);
  Status status = call.ask(&ProviderLibrary::instanceMI, &CMPIInstanceMIFT::getInstance, asked.properties);
  return {std::move(status), call.result().done(), 0};
}

Outcome Dispatcher::getFrom(const Asked& asked, const Route& route, ResultSink& sink) const {
  Arena arena;
  SingleAnswer answer(arena);
  Outcome outcome = ask(asked, route, answer);
  if (outcome.status.code != CMPI_RC_OK)
    return outcome;
  if (!outcome.done)
    diagnostics_.countUnfinished();

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
    diagnostics_.report(named(route) + " answered for " + formatWbemUri(asked.path) + " with " + wrong);
    outcome.status = {CMPI_RC_ERR_NOT_FOUND, named(route) + " answered with " + wrong};
    return outcome;
  }
  if (!outcome.done)
    diagnostics_.report(named(route) + " sent no done marker for " + formatWbemUri(asked.path));
  if (const auto names = propertyNames(asked.properties))
    answer.first()->restrictTo(*names);
  outcome.delivered = 1;
  sink.instance(*answer.first());
  return outcome;
}

UpcallStatus Dispatcher::enumerateInstances(const Context& context, const ObjectPath& path,
                                            const char** properties, ResultSink& sink) {
  return enumerate(Kind::Instances, {path, properties, &context}, sink).status;
}

UpcallStatus Dispatcher::enumerateInstanceNames(const Context& context, const ObjectPath& path,
                                                ResultSink& sink) {
  return enumerate(Kind::Names, {path, nullptr, &context}, sink).status;
}

UpcallStatus Dispatcher::getInstance(const Context& context, const ObjectPath& path, const char** properties,
                                     ResultSink& sink) {
  return get({path, properties, &context}, sink).status;
}

UpcallStatus Dispatcher::associators(const Context& context, const ObjectPath& path,
                                     const AssociationFilter& filter, const char** properties,
                                     ResultSink& sink) {
  return associations_.associators(Kind::Instances, {path, properties, &context}, filter, sink).status;
}

UpcallStatus Dispatcher::associatorNames(const Context& context, const ObjectPath& path,
                                         const AssociationFilter& filter, ResultSink& sink) {
  return associations_.associators(Kind::Names, {path, nullptr, &context}, filter, sink).status;
}

UpcallStatus Dispatcher::references(const Context& context, const ObjectPath& path,
                                    const AssociationFilter& filter, const char** properties,
                                    ResultSink& sink) {
  return associations_.references(Kind::Instances, {path, properties, &context}, filter, sink).status;
}

UpcallStatus Dispatcher::referenceNames(const Context& context, const ObjectPath& path,
                                        const AssociationFilter& filter, ResultSink& sink) {
  return associations_.references(Kind::Names, {path, nullptr, &context}, filter, sink).status;
}

UpcallStatus Dispatcher::createInstance(const Context& context, const ObjectPath& path,
                                        const Instance& instance, ResultSink& sink) {
  return changes_.create({path, nullptr, &context}, instance, sink).status;
}

UpcallStatus Dispatcher::modifyInstance(const Context& context, const ObjectPath& path,
                                        const Instance& instance, const char** properties) {
  return changes_.modify({path, properties, &context}, instance).status;
}

UpcallStatus Dispatcher::deleteInstance(const Context& context, const ObjectPath& path) {
  return changes_.remove({path, nullptr, &context}).status;
}

UpcallStatus Dispatcher::execQuery(const Context& context, const ObjectPath& path, std::string_view query,
                                   std::string_view language, ResultSink& sink) {
  return changes_.query({path, nullptr, &context}, query, language, sink).status;
}

}  // namespace cimom
