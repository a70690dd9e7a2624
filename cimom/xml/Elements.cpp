#include <cimom/xml/Elements.h>
#include <cimom/xml/Types.h>

#include <algorithm>

namespace cimom::xml {

namespace {

constexpr std::string_view blanks = " \t\r\n";

std::string joined(std::initializer_list<std::string_view> names) {
  std::string text;
  for (const std::string_view name : names)
    text.append(text.empty() ? "" : " or ").append(name);
  return text;
}

bool isTrue(const Node& node, std::string_view attributeName) {
  const std::string* const text = node.attribute(attributeName);
  if (text == nullptr || *text == "false" || *text == "FALSE")
    return false;
  if (*text == "true" || *text == "TRUE")
    return true;
  failStructure(node.line, std::string(attributeName) + " is true or false, not \"" + *text + "\"");
}

CMPIType readType(const Node& node) {
  const std::string& name = required(node, "TYPE");
  const CMPIType type = typeOf(name);
  if (type == CMPI_null)
    failStructure(node.line, "\"" + name + "\" is no type");
  return type;
}

std::vector<ValueText> readArray(const Node& node) {
  std::vector<ValueText> texts;
  Children children(node);
  while (const Node* const element = children.take({"VALUE", "VALUE.NULL"})) {
    if (element->name == "VALUE")
      texts.emplace_back(textOnly(*element));
    else
      texts.emplace_back(std::nullopt);
  }
  children.end();
  return texts;
}

ElementValue readValue(const Node& node) {
  if (node.name == "VALUE")
    return textOnly(node);
  if (node.name == "VALUE.ARRAY")
    return readArray(node);
  return readReference(node);
}

// The value of a property or a qualifier, null where there is none.
ElementValue takeValue(Children& children, std::initializer_list<std::string_view> names) {
  const Node* const value = children.take(names);
  return value == nullptr ? ElementValue() : readValue(*value);
}

QualifierElement readQualifier(const Node& node) {
  QualifierElement qualifier;
  qualifier.name = required(node, "NAME");
  qualifier.type = readType(node);
  Children children(node);
  qualifier.value = takeValue(children, {"VALUE", "VALUE.ARRAY"});
  children.end();
  if (std::holds_alternative<std::vector<ValueText>>(qualifier.value))
    qualifier.type = static_cast<CMPIType>(qualifier.type | CMPI_ARRAY);
  return qualifier;
}

std::vector<QualifierElement> takeQualifiers(Children& children) {
  std::vector<QualifierElement> qualifiers;
  while (const Node* const qualifier = children.take("QUALIFIER"))
    qualifiers.push_back(readQualifier(*qualifier));
  return qualifiers;
}

// Written in both ways by clients: the document type had the attribute in capitals once.
PropertyElement::Embedded readEmbedded(const Node& node) {
  const std::string* text = node.attribute("EmbeddedObject");
  if (text == nullptr)
    text = node.attribute("EMBEDDEDOBJECT");
  if (text == nullptr)
    return PropertyElement::Embedded::none;
  if (*text == "object")
    return PropertyElement::Embedded::object;
  if (*text == "instance")
    return PropertyElement::Embedded::instance;
  failStructure(node.line, "EmbeddedObject is object or instance, not \"" + *text + "\"");
}

std::string optional(const Node& node, std::string_view attributeName) {
  const std::string* const text = node.attribute(attributeName);
  return text == nullptr ? std::string() : *text;
}

PropertyElement readProperty(const Node& node) {
  PropertyElement property;
  property.name = required(node, "NAME");
  property.classOrigin = optional(node, "CLASSORIGIN");
  property.propagated = isTrue(node, "PROPAGATED");
  Children children(node);
  property.qualifiers = takeQualifiers(children);
  if (node.name == "PROPERTY.REFERENCE") {
    property.type = CMPI_ref;
    property.referenceClass = optional(node, "REFERENCECLASS");
    property.value = takeValue(children, {"VALUE.REFERENCE"});
  } else {
    const bool isArray = node.name == "PROPERTY.ARRAY";
    property.type = readType(node);
    if (property.type == CMPI_ref)
      failStructure(node.line, "a reference is a PROPERTY.REFERENCE");
    if (isArray)
      property.type = static_cast<CMPIType>(property.type | CMPI_ARRAY);
    property.embedded = readEmbedded(node);
    property.value = takeValue(children, {isArray ? "VALUE.ARRAY" : "VALUE"});
  }
  children.end();
  return property;
}

std::vector<PropertyElement> takeProperties(Children& children) {
  std::vector<PropertyElement> properties;
  while (const Node* const property = children.take({"PROPERTY", "PROPERTY.ARRAY", "PROPERTY.REFERENCE"}))
    properties.push_back(readProperty(*property));
  return properties;
}

InstanceElement readNamedInstance(const Node& node) {
  Children children(node);
  const Node& name = children.expect("INSTANCENAME");
  InstanceElement instance = readInstanceElement(children.expect("INSTANCE"));
  instance.name = readObjectName(name);
  children.end();
  return instance;
}

// Of methods the name alone: no operation that takes a class goes as far as to read more.
ClassElement readClass(const Node& node) {
  ClassElement element;
  element.name = required(node, "NAME");
  element.superClass = optional(node, "SUPERCLASS");
  Children children(node);
  element.qualifiers = takeQualifiers(children);
  element.properties = takeProperties(children);
  while (const Node* const method = children.take("METHOD"))
    element.methods.push_back(required(*method, "NAME"));
  children.end();
  return element;
}

QualifierDeclarationElement readQualifierDeclaration(const Node& node) {
  QualifierDeclarationElement declaration;
  declaration.name = required(node, "NAME");
  declaration.type = readType(node);
  Children children(node);
  children.take("SCOPE");
  declaration.value = takeValue(children, {"VALUE", "VALUE.ARRAY"});
  children.end();
  if (isTrue(node, "ISARRAY") || std::holds_alternative<std::vector<ValueText>>(declaration.value))
    declaration.type = static_cast<CMPIType>(declaration.type | CMPI_ARRAY);
  return declaration;
}

ParameterValue readParameterValue(const Node& node) {
  if (node.name == "VALUE")
    return textOnly(node);
  if (node.name == "VALUE.ARRAY")
    return readArray(node);
  if (node.name == "VALUE.REFERENCE")
    return readReference(node);
  if (node.name == "CLASS")
    return readClass(node);
  if (node.name == "INSTANCE")
    return readInstanceElement(node);
  if (node.name == "VALUE.NAMEDINSTANCE")
    return readNamedInstance(node);
  if (node.name == "QUALIFIER.DECLARATION")
    return readQualifierDeclaration(node);
  return readObjectName(node);
}

}  // namespace

Children::Children(const Node& parent) : parent_(parent) {
  if (parent.text.find_first_not_of(blanks) != std::string::npos)
    failStructure(parent.line, parent.name + " holds elements, not text");
}

const Node* Children::take(std::initializer_list<std::string_view> names) {
  if (next_ == parent_.children.size())
    return nullptr;
  const Node& child = parent_.children[next_];
  if (std::find(names.begin(), names.end(), child.name) == names.end())
    return nullptr;
  ++next_;
  return &child;
}

const Node& Children::expect(std::initializer_list<std::string_view> names) {
  if (const Node* const child = take(names); child != nullptr)
    return *child;
  const bool isEnd = next_ == parent_.children.size();
  const Node& where = isEnd ? parent_ : parent_.children[next_];
  failStructure(where.line, "expected " + joined(names) + " in " + parent_.name + ", got " +
                                (isEnd ? std::string("its end") : where.name));
}

void Children::end() const {
  if (next_ == parent_.children.size())
    return;
  const Node& child = parent_.children[next_];
  failStructure(child.line, child.name + " does not belong here in " + parent_.name);
}

const std::string& required(const Node& node, std::string_view attributeName) {
  const std::string* const text = node.attribute(attributeName);
  if (text == nullptr)
    failStructure(node.line, node.name + " has no attribute " + std::string(attributeName));
  return *text;
}

const std::string& textOnly(const Node& node) {
  if (!node.children.empty())
    failStructure(node.line, node.name + " holds text, not elements");
  return node.text;
}

InstanceElement readInstanceElement(const Node& node) {
  InstanceElement instance;
  instance.className = required(node, "CLASSNAME");
  Children children(node);
  instance.qualifiers = takeQualifiers(children);
  instance.properties = takeProperties(children);
  children.end();
  return instance;
}

Parameter readParameter(const Node& node) {
  Parameter parameter;
  parameter.name = required(node, "NAME");
  Children children(node);
  const Node* const value =
      children.take({"VALUE", "VALUE.ARRAY", "VALUE.REFERENCE", "CLASSNAME", "INSTANCENAME",
                     "QUALIFIER.DECLARATION", "CLASS", "INSTANCE", "VALUE.NAMEDINSTANCE"});
  if (value != nullptr)
    parameter.value = readParameterValue(*value);
  children.end();
  return parameter;
}

}  // namespace cimom::xml
