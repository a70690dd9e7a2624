#include <cimom/Names.h>
#include <cimom/xml/ClassWriter.h>
#include <cimom/xml/QualifierWriter.h>
#include <cimom/xml/Types.h>
#include <cimom/xml/ValueWriter.h>

#include <algorithm>

namespace cimom::xml {

namespace {

class Writer {
 public:
  Writer(std::string& out, const ClassRepository& classes, const SchemaClass& which,
         const ClassOptions& options)
      : out_(out), classes_(classes), which_(which), options_(options) {}

  void write() {
    out_ += "<CLASS";
    appendAttribute(out_, "NAME", which_.name());
    if (which_.superclass != nullptr)
      appendAttribute(out_, "SUPERCLASS", which_.superclass->name());
    out_ += '>';
    writeQualifiers(which_.qualifiers, &which_.declared.qualifiers);
    for (const mof::Property& property : which_.properties)
      if (isWanted(property))
        writeProperty(property);
    for (const mof::Method& method : which_.methods)
      writeMethod(method);
    out_ += "</CLASS>";
  }

 private:
  void writeQualifiers(const mof::Qualifiers& inEffect, const mof::Qualifiers* own) {
    if (options_.includeQualifiers)
      appendQualifiers(out_, classes_, inEffect, own, options_.localOnly);
  }

  [[nodiscard]] bool isWanted(const mof::Property& property) const {
    if (options_.localOnly && ownProperty(which_, property.name) == nullptr)
      return false;
    if (!options_.properties)
      return true;
    const auto& names = *options_.properties;
    return std::any_of(names.begin(), names.end(),
                       [&](const std::string& name) { return sameName(name, property.name); });
  }

  void writeOrigin(const std::string& origin, bool isPropagated) {
    if (options_.includeClassOrigin)
      appendAttribute(out_, "CLASSORIGIN", origin);
    if (isPropagated)
      out_ += " PROPAGATED=\"true\"";
  }

  void writeArraySize(std::uint32_t size) {
    if (size != 0)
      appendAttribute(out_, "ARRAYSIZE", std::to_string(size));
  }

  void writeProperty(const mof::Property& property) {
    const mof::Property* const own = ownProperty(which_, property.name);
    const char* const element = property.isReference() ? "PROPERTY.REFERENCE"
                                : property.isArray()   ? "PROPERTY.ARRAY"
                                                       : "PROPERTY";
    out_.append("<").append(element);
    appendAttribute(out_, "NAME", property.name);
    if (property.isReference())
      appendAttribute(out_, "REFERENCECLASS", property.referenceClass);
    else
      appendAttribute(out_, "TYPE", typeName(property.type));
    if (property.isArray())
      writeArraySize(property.arraySize);
    writeOrigin(property.origin, own == nullptr);
    if (!property.isReference())
      appendEmbedded(out_, property.qualifiers);
    out_ += '>';
    writeQualifiers(property.qualifiers, own == nullptr ? nullptr : &own->qualifiers);
    if (property.defaultValue && !property.isReference())
      appendMofValue(out_, *property.defaultValue, property.type);
    out_.append("</").append(element).append(">");
  }

  [[nodiscard]] const mof::Method* ownMethod(const mof::Method& method) const {
    const auto& all = which_.declared.methods;
    const auto found = std::find_if(
        all.begin(), all.end(), [&](const mof::Method& each) { return sameName(each.name, method.name); });
    return found == all.end() ? nullptr : &*found;
  }

  void writeMethod(const mof::Method& method) {
    const mof::Method* const own = ownMethod(method);
    if (options_.localOnly && own == nullptr)
      return;
    out_ += "<METHOD";
    appendAttribute(out_, "NAME", method.name);
    if (method.type != CMPI_null)
      appendAttribute(out_, "TYPE", typeName(method.type));
    writeOrigin(method.origin, own == nullptr);
    out_ += '>';
    writeQualifiers(method.qualifiers, own == nullptr ? nullptr : &own->qualifiers);
    for (const mof::Parameter& parameter : method.parameters)
      writeParameter(parameter, own != nullptr);
    out_ += "</METHOD>";
  }

  void writeParameter(const mof::Parameter& parameter, bool isOwn) {
    const bool isArray = (parameter.type & CMPI_ARRAY) != 0;
    const bool isReference = (parameter.type & ~CMPI_ARRAY) == CMPI_ref;
    std::string element = "PARAMETER";
    if (isReference)
      element += isArray ? ".REFARRAY" : ".REFERENCE";
    else if (isArray)
      element += ".ARRAY";
    out_.append("<").append(element);
    appendAttribute(out_, "NAME", parameter.name);
    if (isReference)
      appendAttribute(out_, "REFERENCECLASS", parameter.referenceClass);
    else
      appendAttribute(out_, "TYPE", typeName(parameter.type));
    if (isArray)
      writeArraySize(parameter.arraySize);
    out_ += '>';
    writeQualifiers(parameter.qualifiers, isOwn ? &parameter.qualifiers : nullptr);
    out_.append("</").append(element).append(">");
  }

  std::string& out_;
  const ClassRepository& classes_;
  const SchemaClass& which_;
  const ClassOptions& options_;
};

}  // namespace

void appendClass(std::string& out, const ClassRepository& classes, const SchemaClass& which,
                 const ClassOptions& options) {
  Writer(out, classes, which, options).write();
}

void appendClassWithPath(std::string& out, const ClassRepository& classes, const SchemaClass& which,
                         const ClassOptions& options, const Location& location) {
  out += "<VALUE.OBJECTWITHPATH>";
  appendClassPath(out, which.name(), location);
  appendClass(out, classes, which, options);
  out += "</VALUE.OBJECTWITHPATH>";
}

}  // namespace cimom::xml
