// What MOF text declares, as plain records: classes, qualifiers, properties, methods and instances.
#pragma once

#include <cmpi/cmpidt.h>

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <variant>
#include <vector>

namespace cimom::mof {

/// One value of a MOF text. `std::monostate` is NULL. Integers keep their sign: what does not fit a signed
/// number is unsigned. A `char16` literal is a CMPIChar16; datetimes and references are texts, an alias that
/// stands for a reference with its `$`.
using Scalar =
    std::variant<std::monostate, bool, std::int64_t, std::uint64_t, double, CMPIChar16, std::string>;

/// A scalar or an array of them. NULL is a scalar.
struct Value {
  bool isArray = false;
  std::vector<Scalar> elements;  ///< exactly one where not an array

  [[nodiscard]] bool isNull() const {
    return !isArray && std::holds_alternative<std::monostate>(elements.front());
  }
  friend bool operator==(const Value&, const Value&) = default;
};

struct Qualifier {
  std::string name;
  Value value;  ///< `true` where the text gives none
  friend bool operator==(const Qualifier&, const Qualifier&) = default;
};

using Qualifiers = std::vector<Qualifier>;

/// The qualifier of this name, or nullptr.
[[nodiscard]] const Qualifier* findQualifier(const Qualifiers& qualifiers, std::string_view name);

/// Whether the qualifier is there and true.
[[nodiscard]] bool isTrue(const Qualifiers& qualifiers, std::string_view name);

/// The text of a string qualifier; empty where it is absent or no single text.
[[nodiscard]] std::string_view textOf(const Qualifiers& qualifiers, std::string_view name);

struct Property {
  std::string name;
  CMPIType type = CMPI_null;   ///< with CMPI_ARRAY for an array
  std::string referenceClass;  ///< of a reference: the class it refers to
  bool key = false;
  std::string origin;  ///< the class that introduced it; an override keeps the origin
  std::optional<Value> defaultValue;
  Qualifiers qualifiers;
  std::uint32_t arraySize = 0;  ///< of a fixed-size array; 0: any size
  int line = 0;

  [[nodiscard]] bool isArray() const { return (type & CMPI_ARRAY) != 0; }
  [[nodiscard]] bool isReference() const { return (type & ~CMPI_ARRAY) == CMPI_ref; }
};

struct Parameter {
  std::string name;
  CMPIType type = CMPI_null;
  std::string referenceClass;
  Qualifiers qualifiers;
  std::uint32_t arraySize = 0;
};

struct Method {
  std::string name;
  CMPIType type = CMPI_null;
  std::string origin;
  std::vector<Parameter> parameters;
  Qualifiers qualifiers;
};

struct Class {
  std::string name;
  std::string superclass;  ///< empty: none
  Qualifiers qualifiers;
  std::vector<Property> properties;
  std::vector<Method> methods;
  std::string file;
  int line = 0;
};

/// `qualifier Key : boolean = false, Scope(property, reference);`
struct QualifierDeclaration {
  std::string name;
  CMPIType type = CMPI_null;
  std::optional<Value> defaultValue;
  std::vector<std::string> scopes;   ///< as written
  std::vector<std::string> flavors;  ///< as written
  std::uint32_t arraySize = 0;
  int line = 0;

  [[nodiscard]] bool toSubclass() const;  ///< subclasses inherit it: all but those of flavor Restricted
};

/// `instance of C as $Alias { Name = "x"; };`
struct InstanceDeclaration {
  std::string nameSpace;  ///< of the last `#pragma namespace` before it in its text; empty: none
  std::string className;
  std::string alias;  ///< with its `$`; empty: none
  std::vector<std::pair<std::string, Value>> values;
  std::string file;
  int line = 0;
};

}  // namespace cimom::mof
