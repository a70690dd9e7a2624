// A small CIM object manager: classes read from MOF, providers loaded through CMPI, requests dispatched to
// them.
//
// It knows classes and providers only from what it is configured with, and nothing of what any provider is
// about. Instances that the schema declares it serves itself, each in its namespace, as a provider would.
// Threads: requests may be made from several threads at once.
#pragma once

#include <cimom/Interop.h>
#include <cimom/Outcome.h>
#include <cimom/ProviderRegistration.h>
#include <cimom/broker/Objects.h>
#include <cimom/mof/ClassRepository.h>
#include <cmpi/cmpidt.h>

#include <cstdint>
#include <filesystem>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace cimom {

struct Configuration {
  std::vector<std::filesystem::path> schema;    ///< MOF files, in the order in which they are compiled
  std::vector<ProviderRegistration> providers;  ///< which library serves which classes
  std::filesystem::path providerFolder;         ///< where libNAME.so of a registration is looked for
  std::function<void(std::string_view)> log;    ///< one line of diagnostics a call; empty: none
  /// None: the object manager tells nothing of itself, and the instances that the schema declares are not
  /// there.
  std::optional<InteropSettings> interop = {};
};

/// Takes each object while it is valid: only during the call. Returning false ends the delivery, not the
/// request.
using InstanceSink = std::function<bool(const Instance&)>;
using PathSink = std::function<bool(const ObjectPath&)>;

/// Names of properties to deliver; none: all.
using PropertyList = std::optional<std::vector<std::string>>;

/// What narrows an association request; an empty text narrows nothing. Names ignore case.
struct AssociationQuery {
  std::string associationClass = {};  ///< the association's class, or an ancestor of it
  std::string resultClass = {};       ///< the class of the object at the far end, or an ancestor of it
  std::string role = {};              ///< the association's reference to the source
  std::string resultRole = {};        ///< the association's reference to the far end
};

class ObjectManager {
 public:
  /// Reads the schema. Throws `MofError` (file, line, what was expected), also for a declared instance that
  /// cannot be one, or `std::runtime_error` where a registered class is not in the schema, is registered
  /// twice in a namespace or has declared instances there. Providers are loaded when a request first needs
  /// them; `tzset` is called once before. They are cleaned up and unloaded with the object manager, when no
  /// request may be under way.
  explicit ObjectManager(const Configuration& configuration);
  ~ObjectManager();
  ObjectManager(const ObjectManager&) = delete;
  ObjectManager& operator=(const ObjectManager&) = delete;

  [[nodiscard]] const ClassRepository& classes() const;

  /// The broker's view of the classes, for whoever parses paths (`parseWbemUri`).
  [[nodiscard]] const ClassTable& classTable() const;

  /// Instances of the class and of all classes below it, each once and at once as it comes from a provider.
  /// An empty namespace is the one that the class is registered in. Of a property list, keys are always
  /// delivered, and names that are no properties mean nothing.
  ///
  /// CMPI_RC_ERR_INVALID_NAMESPACE for a namespace in which nothing is registered, CMPI_RC_ERR_INVALID_CLASS
  /// for a class that the schema lacks, CMPI_RC_ERR_NOT_SUPPORTED for one without a provider,
  /// CMPI_RC_ERR_FAILED where the provider's library cannot be loaded (the description says why), else the
  /// provider's own status. What a sink throws is thrown here.
  Outcome enumerateInstances(std::string_view nameSpace, std::string_view className,
                             const PropertyList& properties, const InstanceSink& sink);
  Outcome enumerateInstanceNames(std::string_view nameSpace, std::string_view className,
                                 const PathSink& sink);

  /// One instance or a status: as above, and CMPI_RC_ERR_INVALID_PARAMETER where the text is no path or its
  /// keys do not fit the class, CMPI_RC_ERR_NOT_FOUND where the provider's answer is none, more than one, or
  /// one with other keys. `path` is a WBEM URI text (`formatWbemUri`), with or without the namespace.
  Outcome getInstance(std::string_view path, const PropertyList& properties, const InstanceSink& sink);

  // Each request that names an object by a text also takes the path itself. The caller makes it, with
  // `classTable()`, in an arena of its own that outlives the request; a path without a namespace is in the
  // one that its class is registered in.

  Outcome getInstance(const ObjectPath& path, const PropertyList& properties, const InstanceSink& sink);

  /// The objects at the far ends of the source's associations, or their paths. `path` names the source as in
  /// `getInstance`; its class need not have a provider.
  ///
  /// The provider of each concrete class registered for associations, from `associationClass` down (none
  /// given: of every one), is asked with that class's name, in the order of the schema. One that fails does
  /// not keep the others from being asked; the first failure is the outcome. Where no class is registered,
  /// the answer is empty. What a class delivers that one asked before it delivered too is left out; that
  /// takes memory for the paths of the answer where several classes are asked, else none.
  ///
  /// Roles go by what the provider delivers in an association's references, not by their declaration: the
  /// first path of an enumeration of the association's names tells the class in each. The enumeration is
  /// made, and costs its time, when a request first names one of these references, and again only as long as
  /// it delivered nothing. Until then, and for a class that stands in no reference of that path, the
  /// declaration counts. Where one class stands at both ends it cannot tell them apart: that is left to the
  /// provider, which is given the roles and the result class too.
  ///
  /// An association that is declared in one namespace and refers to objects of another is found from both;
  /// its own path, and what stands at its ends, name their namespaces. One that is declared with a class in
  /// the place of an object ends on each instance that the class's provider has at the time.
  ///
  /// CMPI_RC_ERR_INVALID_PARAMETER for a source whose text is no path, whose class the schema lacks or whose
  /// keys do not fit it, an association class that the schema lacks or that is no association, and a result
  /// class that it lacks; CMPI_RC_ERR_NOT_SUPPORTED from a provider without the operation; else as above.
  Outcome associators(std::string_view path, const AssociationQuery& query, const PropertyList& properties,
                      const InstanceSink& sink);
  Outcome associators(const ObjectPath& path, const AssociationQuery& query, const PropertyList& properties,
                      const InstanceSink& sink);
  Outcome associatorNames(std::string_view path, const AssociationQuery& query, const PathSink& sink);
  Outcome associatorNames(const ObjectPath& path, const AssociationQuery& query, const PathSink& sink);

  /// The associations that refer to the source, or their paths: as above, with `associationClass` as the
  /// class of the answer. With a role, the reference of that name must hold the source. Result class and
  /// result role mean nothing here.
  Outcome references(std::string_view path, const AssociationQuery& query, const PropertyList& properties,
                     const InstanceSink& sink);
  Outcome references(const ObjectPath& path, const AssociationQuery& query, const PropertyList& properties,
                     const InstanceSink& sink);
  Outcome referenceNames(std::string_view path, const AssociationQuery& query, const PathSink& sink);
  Outcome referenceNames(const ObjectPath& path, const AssociationQuery& query, const PathSink& sink);

  /// Asks the provider of the instance's class to make it. The sink is given the path that the provider
  /// answers with; the instance's own path needs no keys. The provider's answer is passed on as it is.
  ///
  /// CMPI_RC_ERR_INVALID_NAMESPACE and CMPI_RC_ERR_INVALID_CLASS as above, CMPI_RC_ERR_INVALID_PARAMETER
  /// where a key that is set has another type than the class declares, CMPI_RC_ERR_NOT_SUPPORTED for a class
  /// without a provider, for declared instances and where the provider lacks the operation.
  Outcome createInstance(std::string_view nameSpace, const Instance& instance, const PathSink& sink);

  /// Asks the provider to change the instance that `instance.path()`, with namespace and all keys, names to
  /// the values that it has set; of a property list only those that it names. Errors as for
  /// `createInstance`; also CMPI_RC_ERR_INVALID_PARAMETER for keys that do not fit the class. Nothing is
  /// delivered.
  Outcome modifyInstance(const Instance& instance, const PropertyList& properties);

  /// Asks the provider to remove the instance. As `modifyInstance`.
  Outcome deleteInstance(const ObjectPath& path);

  /// Asks the provider of the class that stands after FROM, in whatever language that is: what it answers
  /// with is passed on as it is, because a query may select anything.
  ///
  /// Where no class of the schema is found there, CMPI_RC_ERR_INVALID_QUERY for the standard's languages
  /// (WQL, CQL) and CMPI_RC_ERR_QUERY_LANGUAGE_NOT_SUPPORTED for all others; else as for `createInstance`.
  Outcome execQuery(std::string_view nameSpace, std::string_view language, std::string_view query,
                    const InstanceSink& sink);

  /// The namespaces that requests may be made in, each as it was first written.
  [[nodiscard]] std::vector<std::string> nameSpaces() const;
  /// Whether it is one of them. Case and leading slashes do not count.
  [[nodiscard]] bool knowsNameSpace(std::string_view nameSpace) const;

  /// How often, since the start, a provider ended an answer with CMPI_RC_OK but without the done marker: what
  /// it had delivered until then was the answer.
  [[nodiscard]] std::uint64_t unfinishedAnswers() const;

 private:
  struct State;
  std::unique_ptr<State> state_;
};

}  // namespace cimom
