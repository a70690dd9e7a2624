// Classes in the forms of DSP0203.
#pragma once

#include <cimom/mof/ClassRepository.h>
#include <cimom/xml/PathWriter.h>

#include <optional>
#include <string>
#include <vector>

namespace cimom::xml {

struct ClassOptions {
  bool localOnly = true;  ///< only what the class itself declares or overrides
  bool includeQualifiers = true;
  bool includeClassOrigin = false;
  /// Only properties of these names; methods and qualifiers of the class are not concerned.
  std::optional<std::vector<std::string>> properties = {};
};

/// CLASS, with its methods. `classes` has the qualifiers' declarations.
void appendClass(std::string& out, const ClassRepository& classes, const SchemaClass& which,
                 const ClassOptions& options);

/// VALUE.OBJECTWITHPATH with CLASSPATH and CLASS: Associators and References of a class.
void appendClassWithPath(std::string& out, const ClassRepository& classes, const SchemaClass& which,
                         const ClassOptions& options, const Location& location);

}  // namespace cimom::xml
