// Instances in the forms of DSP0203, with the properties that a request asks for.
#pragma once

#include <cimom/broker/Objects.h>
#include <cimom/mof/ClassRepository.h>
#include <cimom/xml/PathWriter.h>

#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace cimom::xml {

enum class InstanceForm {
  instance,          ///< INSTANCE: GetInstance, PullInstances of a query
  namedInstance,     ///< VALUE.NAMEDINSTANCE: EnumerateInstances
  instanceWithPath,  ///< VALUE.INSTANCEWITHPATH: PullInstancesWithPath
  objectWithPath,    ///< VALUE.OBJECTWITHPATH: Associators, References
  object             ///< VALUE.OBJECT: ExecQuery
};

/// Which properties of an instance are shown, and how. Each condition narrows further.
struct InstanceOptions {
  InstanceForm form = InstanceForm::namedInstance;
  Location location = {};  ///< of paths that carry no host or namespace
  /// The class that the request named; nullptr where it named none (Associators). It counts only for the two
  /// options below.
  const SchemaClass* requested = nullptr;
  /// False: only properties that the requested class has, be they its own or inherited.
  bool deepInheritance = true;
  /// Only properties that are declared or overridden in the class of the instance, or in one between it and
  /// the requested class, that one included. With `deepInheritance` false: in the requested class.
  bool localOnly = false;
  bool includeQualifiers = false;
  bool includeClassOrigin = false;
  /// Only properties of these names; names that are no properties mean nothing. Keys count like others here;
  /// the path has them in any case.
  std::optional<std::vector<std::string>> properties = {};
};

/// Writes the instances of one answer. Declared properties that the provider left unset are written as null.
/// What is the same in all instances of a class is made once. Used by one thread at a time; the classes must
/// outlive it. It keeps nothing of an instance.
class InstanceWriter {
 public:
  InstanceWriter(const ClassRepository& classes, InstanceOptions options);
  ~InstanceWriter();
  InstanceWriter(const InstanceWriter&) = delete;
  InstanceWriter& operator=(const InstanceWriter&) = delete;

  void append(std::string& out, const Instance& instance);

 private:
  struct State;
  std::unique_ptr<State> state_;
};

}  // namespace cimom::xml
