#include <cimom/Changes.h>
#include <cimom/Dispatcher.h>
#include <cimom/KeyCheck.h>
#include <cimom/QueryText.h>
#include <cimom/broker/Arena.h>

#include <string>
#include <utility>

namespace cimom {

namespace {

/// Hands on whatever a provider answers with.
class UnjudgedDelivery final : public Delivery {
 public:
  UnjudgedDelivery(Kind kind, ResultSink& receiver) : Delivery(kind, receiver, nullptr) {}

 private:
  [[nodiscard]] Verdict judge(const ObjectPath& /*path*/, const Instance* /*instance*/) override {
    return Verdict::Wanted;
  }
};

/// The instance with the path that its provider is given.
const CMPIInstance* placed(Arena& arena, const Instance& instance, const ObjectPath& path) {
  Instance* const copy = instance.copyTo(arena);
  (void)copy->setPath(path);  // it is of the same class
  return copy;
}

Outcome concluded(ProviderCall& call, Status status, const Delivery& delivery,
                  const Diagnostics& diagnostics) {
  Outcome outcome = call.concluded(std::move(status), delivery, diagnostics);
  delivery.rethrow();
  outcome.delivered = delivery.delivered();
  return outcome;
}

}  // namespace

const Route* Changes::routeTo(const ObjectPath& path, Keys keys, Status& status) const {
  status = dispatcher_.check(path);
  if (status.code == CMPI_RC_OK)
    status = keys == Keys::All ? checkKeys(path, *path.classInfo()) : checkGivenKeys(path, *path.classInfo());
  if (status.code != CMPI_RC_OK)
    return nullptr;
  const Route* const route = dispatcher_.routes().find(path.nameSpace(), *path.classInfo());
  if (route != nullptr && route->isDeclared()) {
    status =
        notSupported("instances of class " + std::string(path.className()) + " are declared in the schema");
    return nullptr;
  }
  if (route != nullptr && route->instance)
    return route;
  status = notSupported("no provider is registered for class " + std::string(path.className()));
  return nullptr;
}

Outcome Changes::create(const Asked& asked, const Instance& instance, ResultSink& sink) const {
  const Nesting nesting;
  Status status;
  const Route* const route = routeTo(asked.path, Keys::Some, status);
  if (route == nullptr)
    return {std::move(status), false, 0};
  UnjudgedDelivery delivery(Kind::Names, sink);
  ProviderCall call(*route, asked, route->info->name(), 0, delivery);
  status = call.ask(&ProviderLibrary::instanceMI, &CMPIInstanceMIFT::createInstance,
                    placed(call.arena(), instance, asked.path));
  return concluded(call, std::move(status), delivery, dispatcher_.diagnostics());
}

Outcome Changes::modify(const Asked& asked, const Instance& instance) const {
  const Nesting nesting;
  Status status;
  const Route* const route = routeTo(asked.path, Keys::All, status);
  if (route == nullptr)
    return {std::move(status), false, 0};
  Nobody nobody;
  ProviderCall call(*route, asked, route->info->name(), 0, nobody);
  status = call.ask(&ProviderLibrary::instanceMI, &CMPIInstanceMIFT::modifyInstance,
                    placed(call.arena(), instance, asked.path), asked.properties);
  return {std::move(status), call.result().done(), 0};
}

Outcome Changes::remove(const Asked& asked) const {
  const Nesting nesting;
  Status status;
  const Route* const route = routeTo(asked.path, Keys::All, status);
  if (route == nullptr)
    return {std::move(status), false, 0};
  Nobody nobody;
  ProviderCall call(*route, asked, route->info->name(), 0, nobody);
  status = call.ask(&ProviderLibrary::instanceMI, &CMPIInstanceMIFT::deleteInstance);
  return {std::move(status), call.result().done(), 0};
}

Outcome Changes::query(const Asked& asked, std::string_view query, std::string_view language,
                       ResultSink& sink) const {
  const Nesting nesting;
  if (Status status = dispatcher_.checkNameSpace(asked.path); status.code != CMPI_RC_OK)
    return {std::move(status), false, 0};
  const std::string className = classOfQuery(query);
  const std::string languageText(language);
  Arena arena;
  const ObjectPath& path =
      *ObjectPath::create(arena, asked.path.classes(), asked.path.nameSpace(), className);
  if (path.classInfo() == nullptr && !isKnownQueryLanguage(language))
    return {{CMPI_RC_ERR_QUERY_LANGUAGE_NOT_SUPPORTED,
             "no provider was found for query language '" + languageText + "'"},
            false,
            0};
  if (path.classInfo() == nullptr)
    return {{CMPI_RC_ERR_INVALID_QUERY, className.empty() ? "no class was found after FROM in the query"
                                                          : "the schema has no class " + className},
            false,
            0};
  Status status;
  const Route* const route = routeTo(path, Keys::Some, status);
  if (route == nullptr)
    return {std::move(status), false, 0};
  UnjudgedDelivery delivery(Kind::Instances, sink);
  ProviderCall call(*route, {path, nullptr, asked.context}, route->info->name(), 0, delivery);
  const std::string queryText(query);
  status = call.ask(&ProviderLibrary::instanceMI, &CMPIInstanceMIFT::execQuery, queryText.c_str(),
                    languageText.c_str());
  return concluded(call, std::move(status), delivery, dispatcher_.diagnostics());
}

}  // namespace cimom
