#include <cimom/Dispatcher.h>
#include <cimom/ObjectManager.h>
#include <cimom/Routes.h>
#include <cimom/broker/Arena.h>
#include <cimom/broker/Broker.h>
#include <cimom/broker/WbemUri.h>

#include <utility>

namespace cimom {

namespace {

ClassRepository compiled(const std::vector<std::filesystem::path>& schema) {
  ClassRepository repository;
  for (const auto& file : schema)
    repository.compileFile(file);
  repository.checkReferences();
  return repository;
}

BrokerSettings brokerSettings(const Configuration& configuration, UpcallTarget& upcalls) {
  BrokerSettings settings;
  settings.upcalls = &upcalls;
  if (configuration.log) {
    settings.log = [log = configuration.log](const LogEntry& entry) {
      if (!entry.isTrace)
        log(std::string(entry.component) + ": " + std::string(entry.text));
    };
  }
  return settings;
}

/// Hands objects to a client's function.
class InstanceReceiver final : public ResultSink {
 public:
  explicit InstanceReceiver(const InstanceSink& function) : function_(function) {}
  bool instance(Instance& instance) override { return function_(instance); }
  bool path(ObjectPath& /*path*/) override { return true; }

 private:
  const InstanceSink& function_;
};

class PathReceiver final : public ResultSink {
 public:
  explicit PathReceiver(const PathSink& function) : function_(function) {}
  bool instance(Instance& /*instance*/) override { return true; }
  bool path(ObjectPath& path) override { return function_(path); }

 private:
  const PathSink& function_;
};

/// A property list as CMPI has it.
class CmpiProperties {
 public:
  explicit CmpiProperties(const PropertyList& list) {
    if (!list)
      return;
    for (const std::string& each : *list)
      names_.push_back(each.c_str());
    names_.push_back(nullptr);
  }

  [[nodiscard]] const char** get() { return names_.empty() ? nullptr : names_.data(); }

 private:
  std::vector<const char*> names_;
};

}  // namespace

struct ObjectManager::State {
  explicit State(const Configuration& configuration)
      : repository(compiled(configuration.schema)),
        dispatcher(configuration.log),
        broker(repository, brokerSettings(configuration, dispatcher)),
        routes(repository, broker, configuration.providers, configuration.providerFolder, configuration.log) {
    dispatcher.setRoutes(routes);
  }

  /// The path of a class, in the namespace that is meant.
  [[nodiscard]] const ObjectPath& classPath(Arena& arena, std::string_view nameSpace,
                                            std::string_view className) const {
    const std::size_t slashes = std::min(nameSpace.find_first_not_of('/'), nameSpace.size());
    nameSpace.remove_prefix(slashes);
    if (nameSpace.empty())
      nameSpace = routes.defaultNameSpace(className);
    return *ObjectPath::create(arena, broker.classes(), nameSpace, className);
  }

  ClassRepository repository;
  Dispatcher dispatcher;
  Broker broker;
  Routes routes;  ///< goes first: providers are unloaded while the broker is there
};

ObjectManager::ObjectManager(const Configuration& configuration)
    : state_(std::make_unique<State>(configuration)) {}

ObjectManager::~ObjectManager() = default;

const ClassRepository& ObjectManager::classes() const {
  return state_->repository;
}

const ClassTable& ObjectManager::classTable() const {
  return state_->broker.classes();
}

Outcome ObjectManager::enumerateInstances(std::string_view nameSpace, std::string_view className,
                                          const PropertyList& properties, const InstanceSink& sink) {
  Arena arena;
  InstanceReceiver client(sink);
  CmpiProperties list(properties);
  const ObjectPath& path = state_->classPath(arena, nameSpace, className);
  return state_->dispatcher.enumerate(Enumerated::Instances, {path, list.get(), nullptr}, client);
}

Outcome ObjectManager::enumerateInstanceNames(std::string_view nameSpace, std::string_view className,
                                              const PathSink& sink) {
  Arena arena;
  PathReceiver client(sink);
  const ObjectPath& path = state_->classPath(arena, nameSpace, className);
  return state_->dispatcher.enumerate(Enumerated::Names, {path, nullptr, nullptr}, client);
}

Outcome ObjectManager::getInstance(std::string_view path, const PropertyList& properties,
                                   const InstanceSink& sink) {
  Arena arena;
  InstanceReceiver client(sink);
  CmpiProperties list(properties);
  ObjectPath* asked = nullptr;
  try {
    asked = parseWbemUri(arena, state_->broker.classes(), path);
  } catch (const WbemUriError& error) {
    return {{CMPI_RC_ERR_INVALID_PARAMETER, error.what()}, false, 0};
  }
  if (asked->nameSpace().empty())
    asked->setNameSpace(state_->routes.defaultNameSpace(asked->className()));
  return state_->dispatcher.get({*asked, list.get(), nullptr}, client);
}

}  // namespace cimom
