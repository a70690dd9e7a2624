// What the broker must know of classes: names, ancestry, properties and keys.
//
// The broker reads the whole model once, when it is made, and keeps a table of its own for quick look-ups:
// the functions need not be fast, and are called from one thread. Names ignore case wherever they are passed
// in, and are spelled as the schema declares them wherever they come out.
#pragma once

#include <cmpi/cmpidt.h>

#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace cimom {

struct PropertyDeclaration {
  std::string name;
  CMPIType type = CMPI_string;  ///< CMPI_ref for references; with CMPI_ARRAY for arrays
  bool isKey = false;
};

struct ClassDeclaration {
  std::string name;
  std::string superClass;  ///< empty at the top of a hierarchy
  /// Inherited ones too, each once (an override replaces what it overrides), ancestors' first.
  std::vector<PropertyDeclaration> properties;
};

class ClassModel {
 public:
  virtual ~ClassModel() = default;

  [[nodiscard]] virtual std::vector<std::string> classNames() const = 0;
  /// None for a name that is no class.
  [[nodiscard]] virtual std::optional<ClassDeclaration> declaration(std::string_view className) const = 0;
};

}  // namespace cimom
