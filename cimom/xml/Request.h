// What a CIM-XML request says, as plain data: names and texts as the client wrote them, UTF-8, nothing looked
// up in a schema. `Conversion.h` makes CIM objects of it.
#pragma once

#include <cmpi/cmpidt.h>

#include <optional>
#include <string>
#include <string_view>
#include <variant>
#include <vector>

namespace cimom::xml {

struct ObjectName;

/// One key of an instance name.
struct Key {
  /// VALUETYPE of a KEYVALUE, or that the value is a reference.
  enum class Form { text, boolean, numeric, reference };

  std::string name;                   ///< empty for the one key of a class, given without its name
  Form form = Form::text;             ///< "string" where the client said nothing
  CMPIType type = CMPI_null;          ///< TYPE; CMPI_null where the client said nothing
  std::string text;                   ///< of a KEYVALUE
  std::vector<ObjectName> reference;  ///< exactly one for a reference, else none
};

/// A class or an instance: CLASSNAME, CLASSPATH, LOCALCLASSPATH, INSTANCENAME, INSTANCEPATH,
/// LOCALINSTANCEPATH.
struct ObjectName {
  std::string host = {};       ///< empty where the form has none
  std::string nameSpace = {};  ///< "root/cimv2"; empty where the form has none
  std::string className = {};
  bool isInstance = false;
  std::vector<Key> keys = {};  ///< of an instance
};

/// A single value's text; none for null.
using ValueText = std::optional<std::string>;

/// The value of a property or a qualifier: null; VALUE; VALUE.ARRAY, with VALUE.NULL as none;
/// VALUE.REFERENCE.
using ElementValue = std::variant<std::monostate, std::string, std::vector<ValueText>, ObjectName>;

/// QUALIFIER.
struct QualifierElement {
  std::string name;
  CMPIType type = CMPI_null;  ///< with CMPI_ARRAY for an array
  ElementValue value;
};

/// PROPERTY, PROPERTY.ARRAY, PROPERTY.REFERENCE.
struct PropertyElement {
  enum class Embedded { none, object, instance };

  std::string name;
  CMPIType type = CMPI_null;  ///< with CMPI_ARRAY for an array; CMPI_ref for a reference
  ElementValue value;
  Embedded embedded = Embedded::none;  ///< the text is an object in XML
  std::string referenceClass;
  std::string classOrigin;
  bool propagated = false;
  std::vector<QualifierElement> qualifiers;
};

/// INSTANCE, or VALUE.NAMEDINSTANCE with its name.
struct InstanceElement {
  std::string className;
  std::optional<ObjectName> name;
  std::vector<QualifierElement> qualifiers;
  std::vector<PropertyElement> properties;
};

/// CLASS, with the names of its methods.
struct ClassElement {
  std::string name;
  std::string superClass;  ///< empty: none
  std::vector<QualifierElement> qualifiers;
  std::vector<PropertyElement> properties;
  std::vector<std::string> methods;
};

/// QUALIFIER.DECLARATION.
struct QualifierDeclarationElement {
  std::string name;
  CMPIType type = CMPI_null;  ///< with CMPI_ARRAY for an array
  ElementValue value;
};

/// What an IPARAMVALUE holds. `std::monostate` is null: an IPARAMVALUE without content. CLASSNAME,
/// INSTANCENAME and VALUE.REFERENCE are all an ObjectName.
using ParameterValue = std::variant<std::monostate, std::string, std::vector<ValueText>, ObjectName,
                                    InstanceElement, ClassElement, QualifierDeclarationElement>;

struct Parameter {
  std::string name;
  ParameterValue value;
};

/// One call of a method: intrinsic (IMETHODCALL) or of an object (METHODCALL).
struct MethodCall {
  std::string messageId;
  bool isIntrinsic = true;
  std::string name;
  std::string nameSpace;              ///< "root/cimv2", without slashes at its ends
  std::vector<Parameter> parameters;  ///< of an intrinsic call, in the order they came in, any name
  std::optional<ObjectName> object;   ///< of an extrinsic call: whose method it is

  /// The first parameter of this name, whatever its case; nullptr where there is none.
  [[nodiscard]] const Parameter* parameter(std::string_view parameterName) const;
};

}  // namespace cimom::xml
