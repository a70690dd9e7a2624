// Which provider a request goes to: registrations, resolved against the classes once.
#pragma once

#include <cimom/DeclaredInstances.h>
#include <cimom/ProviderLibrary.h>
#include <cimom/ProviderRegistration.h>
#include <cimom/broker/ClassTable.h>
#include <cimom/broker/Result.h>
#include <cimom/mof/ClassRepository.h>

#include <filesystem>
#include <functional>
#include <map>
#include <memory>
#include <span>
#include <string>
#include <string_view>
#include <unordered_map>
#include <utility>
#include <vector>

namespace cimom {

/// One class and who serves it.
struct Route {
  const ClassInfo* info = nullptr;
  const SchemaClass* schema = nullptr;  ///< the same class, as declared
  bool instance = false;
  bool association = false;
  Recycling recycling = Recycling::Off;
  ProviderLibrary* library = nullptr;  ///< null: the class's instances are declared by the schema

  [[nodiscard]] bool isDeclared() const { return library == nullptr; }
};

/// A namespace and the other name that it is found under as well.
struct OtherName {
  std::string nameSpace;
  std::string name;
};

/// Immutable once made, so that any number of threads may read it.
class Routes {
 public:
  /// Throws `RegistrationError` for a registration of a class that the schema lacks, and for two of one
  /// class in one namespace; for one of a class of which instances are declared there, too. No library is
  /// loaded yet. A declared association is found in its own namespace by the instance operations, and by the
  /// association operations in those of its references, too.
  Routes(const ClassRepository& schema, const Broker& broker,
         const std::vector<ProviderRegistration>& registrations, const std::filesystem::path& providerFolder,
         const std::function<void(std::string_view)>& log, const DeclaredInstances& declared,
         OtherName otherName);

  // Names of namespaces ignore case; the other name is another spelling of its namespace.

  [[nodiscard]] bool knowsNameSpace(std::string_view nameSpace) const;
  /// What to call the namespace: other than the text given only where that is the other name of one.
  [[nodiscard]] std::string_view properName(std::string_view nameSpace) const;
  [[nodiscard]] bool isSameNameSpace(std::string_view left, std::string_view right) const;
  /// All of them, in the order of registration.
  [[nodiscard]] std::vector<std::string> nameSpaces() const;

  /// The namespace that is meant where none is given: the first one that the class is registered in, else the
  /// first of all; empty where nothing is registered.
  [[nodiscard]] std::string_view defaultNameSpace(std::string_view className) const;

  /// The provider registered for this very class, or nullptr.
  [[nodiscard]] const Route* find(std::string_view nameSpace, const ClassInfo& info) const;

  /// Those of the class and of every class below it, superclasses first.
  [[nodiscard]] std::vector<const Route*> below(std::string_view nameSpace, const ClassInfo& top) const;

  /// Those of the concrete classes that are registered for associations: of the class and of every class
  /// below it, or all of them where none is given; in the order in which the schema declares them.
  [[nodiscard]] std::vector<const Route*> associations(std::string_view nameSpace,
                                                       const ClassInfo* top) const;

  /// The provider that answers an operation (`Route::instance` or `Route::association`) for instances of this
  /// class: its own, or that of the nearest ancestor that has one. nullptr: none.
  [[nodiscard]] const Route* responsible(std::string_view nameSpace, const ClassInfo& info,
                                         bool Route::*operation) const;

  [[nodiscard]] const ClassTable& classes() const { return classes_; }
  [[nodiscard]] const ClassRepository& schema() const { return schema_; }
  [[nodiscard]] const std::vector<DeclaredInstance>& declared() const { return declared_.all(); }

 private:
  struct NameSpace {
    std::unordered_map<const ClassInfo*, Route> byClass;
    std::unordered_map<const ClassInfo*, Route> foreign;  ///< associations declared elsewhere that end here
    std::vector<const Route*> associations;  ///< of concrete classes, in the order of declaration
  };

  [[nodiscard]] const NameSpace* inNameSpace(std::string_view nameSpace) const;
  NameSpace& makeNameSpace(std::string_view nameSpace);
  void add(const DeclaredInstance& declared);
  void listAssociations();
  ProviderLibrary& library(const ProviderRegistration& registration, const Broker& broker,
                           const std::filesystem::path& folder,
                           const std::function<void(std::string_view)>& log);

  const ClassRepository& schema_;
  const ClassTable& classes_;
  const DeclaredInstances& declared_;
  OtherName otherName_;
  std::map<std::pair<std::string, std::string>, std::unique_ptr<ProviderLibrary>> libraries_;
  std::vector<std::pair<std::string, NameSpace>> nameSpaces_;  ///< few: in the order of registration
};

}  // namespace cimom
