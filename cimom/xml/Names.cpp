#include <cimom/xml/Elements.h>
#include <cimom/xml/Types.h>

namespace cimom::xml {

namespace {

Key::Form readForm(const Node& node) {
  const std::string* const valueType = node.attribute("VALUETYPE");
  if (valueType == nullptr || *valueType == "string")
    return Key::Form::text;
  if (*valueType == "boolean")
    return Key::Form::boolean;
  if (*valueType == "numeric")
    return Key::Form::numeric;
  failStructure(node.line, "VALUETYPE is string, boolean or numeric, not \"" + *valueType + "\"");
}

Key readKey(std::string name, const Node& node) {
  Key key;
  key.name = std::move(name);
  if (node.name == "VALUE.REFERENCE") {
    key.form = Key::Form::reference;
    key.reference.push_back(readReference(node));
    return key;
  }
  key.form = readForm(node);
  key.text = textOnly(node);
  if (const std::string* const type = node.attribute("TYPE"); type != nullptr) {
    key.type = typeOf(*type);
    if (key.type == CMPI_null || key.type == CMPI_ref)
      failStructure(node.line, "\"" + *type + "\" is not the type of a key");
  }
  return key;
}

ObjectName readInstanceName(const Node& node) {
  ObjectName name;
  name.className = required(node, "CLASSNAME");
  name.isInstance = true;
  Children children(node);
  if (const Node* const lone = children.take({"KEYVALUE", "VALUE.REFERENCE"}); lone != nullptr)
    name.keys.push_back(readKey({}, *lone));
  else
    while (const Node* const binding = children.take("KEYBINDING")) {
      Children content(*binding);
      const Node& value = content.expect({"KEYVALUE", "VALUE.REFERENCE"});
      content.end();
      name.keys.push_back(readKey(required(*binding, "NAME"), value));
    }
  children.end();
  return name;
}

ObjectName readClassName(const Node& node) {
  ObjectName name;
  name.className = required(node, "NAME");
  return name;
}

struct Place {
  std::string host;
  std::string nameSpace;
};

Place readNameSpacePath(const Node& node) {
  Children children(node);
  const Node& host = children.expect("HOST");
  const Node& nameSpace = children.expect("LOCALNAMESPACEPATH");
  children.end();
  return {textOnly(host), readNameSpace(nameSpace)};
}

// A path: where it is, and a name.
ObjectName readPath(const Node& node, bool hasHost, bool isInstance) {
  Children children(node);
  const Node& place = children.expect(hasHost ? "NAMESPACEPATH" : "LOCALNAMESPACEPATH");
  const Node& named = children.expect(isInstance ? "INSTANCENAME" : "CLASSNAME");
  children.end();
  ObjectName name = readObjectName(named);
  if (hasHost) {
    Place where = readNameSpacePath(place);
    name.host = std::move(where.host);
    name.nameSpace = std::move(where.nameSpace);
  } else {
    name.nameSpace = readNameSpace(place);
  }
  return name;
}

}  // namespace

std::string readNameSpace(const Node& node) {
  Children children(node);
  std::string nameSpace = required(children.expect("NAMESPACE"), "NAME");
  while (const Node* const part = children.take("NAMESPACE"))
    nameSpace.append("/").append(required(*part, "NAME"));
  children.end();
  // Some clients write the whole name into one element, with slashes around it.
  const std::size_t first = nameSpace.find_first_not_of('/');
  const std::size_t last = nameSpace.find_last_not_of('/');
  return first == std::string::npos ? std::string() : nameSpace.substr(first, last - first + 1);
}

ObjectName readObjectName(const Node& node) {
  if (node.name == "INSTANCENAME")
    return readInstanceName(node);
  if (node.name == "CLASSNAME")
    return readClassName(node);
  const bool hasHost = node.name == "INSTANCEPATH" || node.name == "CLASSPATH";
  const bool isInstance = node.name == "INSTANCEPATH" || node.name == "LOCALINSTANCEPATH";
  return readPath(node, hasHost, isInstance);
}

ObjectName readReference(const Node& node) {
  Children children(node);
  const Node& name = children.expect(
      {"CLASSPATH", "LOCALCLASSPATH", "CLASSNAME", "INSTANCEPATH", "LOCALINSTANCEPATH", "INSTANCENAME"});
  children.end();
  return readObjectName(name);
}

}  // namespace cimom::xml
