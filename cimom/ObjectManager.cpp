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

AssociationFilter filterOf(const AssociationQuery& query) {
  return {query.associationClass.c_str(), query.resultClass.c_str(), query.role.c_str(),
          query.resultRole.c_str()};
}

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

  /// Runs `request(path)` on the path that the text names.
  template <class Request>
  [[nodiscard]] Outcome onPath(std::string_view text, const Request& request) const {
    Arena arena;
    const ObjectPath* path = nullptr;
    try {
      path = parseWbemUri(arena, broker.classes(), text);
      const std::string_view nameSpace =
          path->nameSpace().empty() ? routes.defaultNameSpace(path->className()) : path->nameSpace();
      // Once more, because the namespace is also that of the references in the keys.
      path = parseWbemUri(arena, broker.classes(), text, nameSpace);
    } catch (const WbemUriError& error) {
      return {{CMPI_RC_ERR_INVALID_PARAMETER, error.what()}, false, 0};
    }
    return request(*path);
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
  return state_->dispatcher.enumerate(Kind::Instances, {path, list.get(), nullptr}, client);
}

Outcome ObjectManager::enumerateInstanceNames(std::string_view nameSpace, std::string_view className,
                                              const PathSink& sink) {
  Arena arena;
  PathReceiver client(sink);
  const ObjectPath& path = state_->classPath(arena, nameSpace, className);
  return state_->dispatcher.enumerate(Kind::Names, {path, nullptr, nullptr}, client);
}

Outcome ObjectManager::getInstance(std::string_view path, const PropertyList& properties,
                                   const InstanceSink& sink) {
  InstanceReceiver client(sink);
  CmpiProperties list(properties);
  return state_->onPath(path, [&](const ObjectPath& asked) {
    return state_->dispatcher.get({asked, list.get(), nullptr}, client);
  });
}

Outcome ObjectManager::associators(std::string_view path, const AssociationQuery& query,
                                   const PropertyList& properties, const InstanceSink& sink) {
  InstanceReceiver client(sink);
  CmpiProperties list(properties);
  return state_->onPath(path, [&](const ObjectPath& source) {
    return state_->dispatcher.associations().associators(Kind::Instances, {source, list.get(), nullptr},
                                                         filterOf(query), client);
  });
}

Outcome ObjectManager::associatorNames(std::string_view path, const AssociationQuery& query,
                                       const PathSink& sink) {
  PathReceiver client(sink);
  return state_->onPath(path, [&](const ObjectPath& source) {
    return state_->dispatcher.associations().associators(Kind::Names, {source, nullptr, nullptr},
                                                         filterOf(query), client);
  });
}

Outcome ObjectManager::references(std::string_view path, const AssociationQuery& query,
                                  const PropertyList& properties, const InstanceSink& sink) {
  InstanceReceiver client(sink);
  CmpiProperties list(properties);
  return state_->onPath(path, [&](const ObjectPath& source) {
    return state_->dispatcher.associations().references(Kind::Instances, {source, list.get(), nullptr},
                                                        filterOf(query), client);
  });
}

Outcome ObjectManager::referenceNames(std::string_view path, const AssociationQuery& query,
                                      const PathSink& sink) {
  PathReceiver client(sink);
  return state_->onPath(path, [&](const ObjectPath& source) {
    return state_->dispatcher.associations().references(Kind::Names, {source, nullptr, nullptr},
                                                        filterOf(query), client);
  });
}

}  // namespace cimom
