// Instances that the schema declares, as CIM objects.
//
// A reference whose value is the path of a class, without keys, makes a declared association a pattern: it
// stands for one association with each instance of that class.
#pragma once

#include <cimom/broker/Arena.h>
#include <cimom/broker/ClassTable.h>
#include <cimom/broker/Objects.h>
#include <cimom/mof/ClassRepository.h>
#include <cimom/mof/Declarations.h>

#include <map>
#include <span>
#include <string>
#include <string_view>
#include <vector>

namespace cimom {

/// One of them. Its path and its references have their namespaces.
struct DeclaredInstance {
  const Instance* instance = nullptr;
  const NamedValue* pattern = nullptr;  ///< the reference that is a class; null: none

  [[nodiscard]] std::string_view nameSpace() const { return instance->path().nameSpace(); }
  [[nodiscard]] const ClassInfo& classInfo() const { return instance->classInfo(); }
};

/// Immutable once made, so that any number of threads may read it.
class DeclaredInstances {
 public:
  /// Properties without a value get the default of their class. Each declaration names its namespace. Throws
  /// `MofError` where one cannot be an instance: a key without a value, a path of a class that the schema
  /// lacks, an alias that no declaration before it has, two patterns in one association, two declarations of
  /// one instance.
  DeclaredInstances(const ClassRepository& schema, const ClassTable& classes,
                    std::span<const mof::InstanceDeclaration> declarations);

  /// In the order of their declaration.
  [[nodiscard]] const std::vector<DeclaredInstance>& all() const { return all_; }

 private:
  class Builder;

  Arena arena_;
  std::vector<DeclaredInstance> all_;
};

}  // namespace cimom
