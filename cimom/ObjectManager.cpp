#include <cimom/DeclaredInstances.h>
#include <cimom/Dispatcher.h>
#include <cimom/Names.h>
#include <cimom/ObjectManager.h>
#include <cimom/QueryText.h>
#include <cimom/Routes.h>
#include <cimom/broker/Arena.h>
#include <cimom/broker/Broker.h>
#include <cimom/broker/WbemUri.h>

#include <algorithm>
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

/// The namespaces of registrations and declarations, and then the interop one.
std::vector<std::string> nameSpacesOf(const Configuration& configuration, const ClassRepository& repository) {
  std::vector<std::string> names;
  const InteropSettings& interop = *configuration.interop;
  const auto add = [&](const std::string& given) {
    const std::string& name = sameName(given, interop.otherName) ? interop.nameSpace : given;
    if (std::none_of(names.begin(), names.end(), [&](const auto& known) { return sameName(known, name); }))
      names.push_back(name);
  };
  for (const ProviderRegistration& each : configuration.providers)
    std::for_each(each.nameSpaces.begin(), each.nameSpaces.end(), add);
  for (const mof::InstanceDeclaration& each : repository.instances())
    add(each.nameSpace);
  add(interop.nameSpace);
  return names;
}

std::vector<mof::InstanceDeclaration> declarations(const Configuration& configuration,
                                                   const ClassRepository& repository) {
  if (!configuration.interop)
    return {};
  std::vector<mof::InstanceDeclaration> result = repository.instances();
  for (const mof::InstanceDeclaration& each : result) {
    if (each.nameSpace.empty())
      throw MofError(each.file, each.line, "no #pragma namespace says where the instance belongs");
  }
  const auto own = hostInstances(*configuration.interop, nameSpacesOf(configuration, repository));
  result.insert(result.end(), own.begin(), own.end());
  return result;
}

OtherName otherName(const Configuration& configuration) {
  return configuration.interop ? OtherName{configuration.interop->nameSpace, configuration.interop->otherName}
                               : OtherName();
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

std::string_view withoutSlashes(std::string_view nameSpace) {
  nameSpace.remove_prefix(std::min(nameSpace.find_first_not_of('/'), nameSpace.size()));
  return nameSpace;
}

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
        declared(repository, broker.classes(), declarations(configuration, repository)),
        routes(repository, broker, configuration.providers, configuration.providerFolder, configuration.log,
               declared, otherName(configuration)) {
    dispatcher.setRoutes(routes);
  }

  /// The path of a class, in the namespace that is meant.
  [[nodiscard]] const ObjectPath& classPath(Arena& arena, std::string_view nameSpace,
                                            std::string_view className) const {
    return *ObjectPath::create(arena, broker.classes(), nameSpaceMeant(nameSpace, className), className);
  }

  [[nodiscard]] std::string_view nameSpaceMeant(std::string_view nameSpace,
                                                std::string_view className) const {
    nameSpace = withoutSlashes(nameSpace);
    return nameSpace.empty() ? routes.defaultNameSpace(className) : routes.properName(nameSpace);
  }

  /// Runs `request(path)` on the path that the text names.
  template <class Request>
  [[nodiscard]] Outcome onPath(std::string_view text, const Request& request) const {
    Arena arena;
    ObjectPath* path = nullptr;
    try {
      path = parseWbemUri(arena, broker.classes(), text);
      const std::string_view nameSpace = nameSpaceMeant(path->nameSpace(), path->className());
      // Once more, because the namespace is also that of the references in the keys.
      path = parseWbemUri(arena, broker.classes(), text, nameSpace);
      path->setNameSpace(nameSpace);
    } catch (const WbemUriError& error) {
      return {{CMPI_RC_ERR_INVALID_PARAMETER, error.what()}, false, 0};
    }
    return request(*path);
  }

  /// The path with the namespace that is meant.
  template <class Request>
  [[nodiscard]] Outcome onPath(const ObjectPath& path, const Request& request) const {
    const std::string_view nameSpace = nameSpaceMeant(path.nameSpace(), path.className());
    if (nameSpace == path.nameSpace())
      return request(path);
    Arena arena;
    ObjectPath* const placed = path.copyTo(arena);
    placed->setNameSpace(nameSpace);
    return request(*placed);
  }

  /// What `ObjectManager` does, for a source that is a path or its text.
  template <class Source>
  [[nodiscard]] Outcome get(const Source& source, const PropertyList& properties,
                            const InstanceSink& sink) const {
    InstanceReceiver client(sink);
    CmpiProperties list(properties);
    return onPath(source, [&](const ObjectPath& path) {
      return dispatcher.get({path, list.get(), nullptr}, client);
    });
  }

  using AssociationRequest = Outcome (Associations::*)(Kind kind, const Asked& asked,
                                                       const AssociationFilter& filter,
                                                       ResultSink& sink) const;

  template <class Source>
  [[nodiscard]] Outcome objects(AssociationRequest request, const Source& source,
                                const AssociationQuery& query, const PropertyList& properties,
                                const InstanceSink& sink) const {
    InstanceReceiver client(sink);
    CmpiProperties list(properties);
    return onPath(source, [&](const ObjectPath& path) {
      return (dispatcher.associations().*request)(Kind::Instances, {path, list.get(), nullptr},
                                                  filterOf(query), client);
    });
  }

  template <class Source>
  [[nodiscard]] Outcome names(AssociationRequest request, const Source& source, const AssociationQuery& query,
                              const PathSink& sink) const {
    PathReceiver client(sink);
    return onPath(source, [&](const ObjectPath& path) {
      return (dispatcher.associations().*request)(Kind::Names, {path, nullptr, nullptr}, filterOf(query),
                                                  client);
    });
  }

  ClassRepository repository;
  Dispatcher dispatcher;
  Broker broker;
  DeclaredInstances declared;
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
  return state_->get(path, properties, sink);
}

Outcome ObjectManager::associators(std::string_view path, const AssociationQuery& query,
                                   const PropertyList& properties, const InstanceSink& sink) {
  return state_->objects(&Associations::associators, path, query, properties, sink);
}

Outcome ObjectManager::associatorNames(std::string_view path, const AssociationQuery& query,
                                       const PathSink& sink) {
  return state_->names(&Associations::associators, path, query, sink);
}

Outcome ObjectManager::references(std::string_view path, const AssociationQuery& query,
                                  const PropertyList& properties, const InstanceSink& sink) {
  return state_->objects(&Associations::references, path, query, properties, sink);
}

Outcome ObjectManager::referenceNames(std::string_view path, const AssociationQuery& query,
                                      const PathSink& sink) {
  return state_->names(&Associations::references, path, query, sink);
}

Outcome ObjectManager::getInstance(const ObjectPath& path, const PropertyList& properties,
                                   const InstanceSink& sink) {
  return state_->get(path, properties, sink);
}

Outcome ObjectManager::associators(const ObjectPath& path, const AssociationQuery& query,
                                   const PropertyList& properties, const InstanceSink& sink) {
  return state_->objects(&Associations::associators, path, query, properties, sink);
}

Outcome ObjectManager::associatorNames(const ObjectPath& path, const AssociationQuery& query,
                                       const PathSink& sink) {
  return state_->names(&Associations::associators, path, query, sink);
}

Outcome ObjectManager::references(const ObjectPath& path, const AssociationQuery& query,
                                  const PropertyList& properties, const InstanceSink& sink) {
  return state_->objects(&Associations::references, path, query, properties, sink);
}

Outcome ObjectManager::referenceNames(const ObjectPath& path, const AssociationQuery& query,
                                      const PathSink& sink) {
  return state_->names(&Associations::references, path, query, sink);
}

Outcome ObjectManager::createInstance(std::string_view nameSpace, const Instance& instance,
                                      const PathSink& sink) {
  Arena arena;
  PathReceiver client(sink);
  ObjectPath* const path = instance.path().copyTo(arena);
  path->setNameSpace(state_->nameSpaceMeant(nameSpace, path->className()));
  return state_->dispatcher.changes().create({*path, nullptr, nullptr}, instance, client);
}

Outcome ObjectManager::modifyInstance(const Instance& instance, const PropertyList& properties) {
  CmpiProperties list(properties);
  return state_->onPath(instance.path(), [&](const ObjectPath& path) {
    return state_->dispatcher.changes().modify({path, list.get(), nullptr}, instance);
  });
}

Outcome ObjectManager::deleteInstance(const ObjectPath& path) {
  return state_->onPath(path, [&](const ObjectPath& asked) {
    return state_->dispatcher.changes().remove({asked, nullptr, nullptr});
  });
}

Outcome ObjectManager::execQuery(std::string_view nameSpace, std::string_view language,
                                 std::string_view query, const InstanceSink& sink) {
  Arena arena;
  InstanceReceiver client(sink);
  const ObjectPath& path = state_->classPath(arena, nameSpace, classOfQuery(query));
  return state_->dispatcher.changes().query({path, nullptr, nullptr}, query, language, client);
}

std::vector<std::string> ObjectManager::nameSpaces() const {
  return state_->routes.nameSpaces();
}

bool ObjectManager::knowsNameSpace(std::string_view nameSpace) const {
  return state_->routes.knowsNameSpace(withoutSlashes(nameSpace));
}

std::uint64_t ObjectManager::unfinishedAnswers() const {
  return state_->dispatcher.diagnostics().unfinished();
}

}  // namespace cimom
