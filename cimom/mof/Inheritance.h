// What a class has in effect: its own features over those of its superclass. Every rule of inheritance that a
// class can break is checked here.
#pragma once

#include <cimom/mof/ClassRepository.h>

#include <string_view>

namespace cimom::mof {

/// Looks up what was declared before.
class Declared {
 public:
  virtual ~Declared() = default;
  [[nodiscard]] virtual const SchemaClass* findClass(std::string_view name) const = 0;
  [[nodiscard]] virtual const QualifierDeclaration* findQualifierDeclaration(std::string_view name) const = 0;
};

/// The class in effect. Throws `MofError` with the line of the class or property at fault: an unknown
/// superclass or qualifier, a value that does not fit its type, a property declared twice, an override of
/// another type or of a key.
[[nodiscard]] SchemaClass inEffect(Class declared, const Declared& known);

/// Checks the values of an instance against its class. Throws `MofError`.
void checkInstance(const InstanceDeclaration& instance, const Declared& known);

/// Checks the qualifier's flavors, and that its default fits its type. Throws `MofError`.
void checkQualifierDeclaration(const QualifierDeclaration& declaration, std::string_view file);

}  // namespace cimom::mof
