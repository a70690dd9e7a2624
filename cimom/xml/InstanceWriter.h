// Instances in the forms of DSP0203, with the properties that a request asks for.
#pragma once

#include <cimom/broker/Objects.h>
#include <cimom/mof/ClassRepository.h>
#include <cimom/xml/PathWriter.h>

#include <memory>
#include <optional>
#include <string>
#include <unordered_map>
#include <vector>

namespace cimom::xml {

/// How deep instances are written that properties hold, as the text of EmbeddedObject; those below are empty.
inline constexpr unsigned embeddingDepth = 4;

enum class InstanceForm {
  instance,          ///< INSTANCE: GetInstance, and queries that are pulled
  namedInstance,     ///< VALUE.NAMEDINSTANCE: EnumerateInstances
  instanceWithPath,  ///< VALUE.INSTANCEWITHPATH: instances that are pulled
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
  /// False: only properties that the requested class has, its own and inherited ones.
  bool deepInheritance = true;
  /// Only properties that are declared or overridden in the class of the instance, or in one between it and
  /// the requested class, that one included. With `deepInheritance` false: in the requested class.
  bool localOnly = false;
  /// Qualifiers of the class and of its properties.
  bool includeQualifiers = false;
  bool includeClassOrigin = false;
  /// Only properties of these names; names that are no properties mean nothing. Keys count like others here;
  /// the path has them in any case.
  std::optional<std::vector<std::string>> properties = {};
};

/// Writes the instances of one answer, their properties in the order of the schema. Declared properties that
/// were not set are written as null. What is the same in all instances of a class is made once. Used by one
/// thread at a time; the classes must outlive it. It keeps nothing of an instance.
class InstanceWriter {
 public:
  InstanceWriter(const ClassRepository& classes, InstanceOptions options);
  ~InstanceWriter();
  InstanceWriter(const InstanceWriter&) = delete;
  InstanceWriter& operator=(const InstanceWriter&) = delete;

  void append(std::string& out, const Instance& instance);

 private:
  struct Plan;

  InstanceWriter(const ClassRepository& classes, InstanceOptions options, unsigned depth);
  Plan& planOf(const ClassInfo& info);
  void appendInstance(std::string& out, const Instance& instance);
  void appendEmbeddedText(std::string& out, const Instance& instance);
  void appendEmbeddedValue(std::string& out, const CMPIData& data);

  const ClassRepository& classes_;
  InstanceOptions options_;
  PathWriter path_;
  unsigned depth_;
  std::unordered_map<const ClassInfo*, std::unique_ptr<Plan>> plans_;
  const ClassInfo* lastClass_ = nullptr;
  Plan* lastPlan_ = nullptr;
  std::unique_ptr<InstanceWriter> embedded_;  // of instances in properties
};

}  // namespace cimom::xml
