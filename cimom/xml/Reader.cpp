#include <cimom/Names.h>
#include <cimom/xml/Elements.h>
#include <cimom/xml/Reader.h>

#include <algorithm>

namespace cimom::xml {

namespace {

[[noreturn]] void failUnsupported(const char* cimError, const Node& node, const std::string& message) {
  constexpr int notImplemented = 501;
  throw RequestError(notImplemented, cimError, "line " + std::to_string(node.line) + ": " + message);
}

// Versions of one major number understand each other: "2.0", "2.4", "2.3.1".
void checkVersion(const Node& node, std::string_view attributeName, char major, const char* cimError) {
  const std::string& version = required(node, attributeName);
  if (version.size() < 2 || version[0] != major || version[1] != '.')
    failUnsupported(
        cimError, node,
        std::string(attributeName) + " \"" + version + "\" is not " + major + ".x, the one taken");
}

// The content of METHODCALL's PARAMVALUEs is of no use: the object manager has no such methods.
MethodCall readExtrinsicCall(const Node& node) {
  MethodCall call;
  call.isIntrinsic = false;
  call.name = required(node, "NAME");
  Children children(node);
  call.object = readObjectName(children.expect({"LOCALCLASSPATH", "LOCALINSTANCEPATH"}));
  call.nameSpace = call.object->nameSpace;
  while (const Node* const parameter = children.take("PARAMVALUE"))
    (void)required(*parameter, "NAME");
  if (children.take("RESPONSEDESTINATION") != nullptr)
    failUnsupported("unsupported-operation", node, "answers go to the client that asked, nowhere else");
  children.end();
  return call;
}

MethodCall readIntrinsicCall(const Node& node) {
  MethodCall call;
  call.name = required(node, "NAME");
  Children children(node);
  call.nameSpace = readNameSpace(children.expect("LOCALNAMESPACEPATH"));
  while (const Node* const parameter = children.take("IPARAMVALUE"))
    call.parameters.push_back(readParameter(*parameter));
  if (children.take("RESPONSEDESTINATION") != nullptr)
    failUnsupported("unsupported-operation", node, "answers go to the client that asked, nowhere else");
  children.end();
  return call;
}

MethodCall readSimpleRequest(const Node& node) {
  Children children(node);
  while (children.take("CORRELATOR") != nullptr) {
  }
  const Node& call = children.expect({"IMETHODCALL", "METHODCALL"});
  children.end();
  return call.name == "IMETHODCALL" ? readIntrinsicCall(call) : readExtrinsicCall(call);
}

MethodCall readMessage(const Node& node) {
  checkVersion(node, "PROTOCOLVERSION", '1', "unsupported-protocol-version");
  const std::string& id = required(node, "ID");
  Children children(node);
  const Node& content = children.expect({"SIMPLEREQ", "MULTIREQ", "SIMPLEEXPREQ", "MULTIEXPREQ", "SIMPLERSP",
                                         "MULTIRSP", "SIMPLEEXPRSP", "MULTIEXPRSP", "SIMPLEREQACK"});
  children.end();
  if (content.name == "MULTIREQ")
    failUnsupported("multiple-requests-unsupported", content, "only simple requests are taken");
  if (content.name != "SIMPLEREQ")
    failUnsupported("unsupported-operation", content, content.name + " is no request for an operation");
  MethodCall call = readSimpleRequest(content);
  call.messageId = id;
  return call;
}

}  // namespace

const Parameter* MethodCall::parameter(std::string_view parameterName) const {
  const auto found = std::find_if(parameters.begin(), parameters.end(),
                                  [&](const Parameter& each) { return sameName(each.name, parameterName); });
  return found == parameters.end() ? nullptr : &*found;
}

MethodCall readRequest(std::string_view body, const Limits& limits) {
  const Node root = parseDocument(body, limits);
  if (root.name != "CIM")
    failStructure(root.line, "the document's element is " + root.name + ", not CIM");
  checkVersion(root, "CIMVERSION", '2', "unsupported-cim-version");
  checkVersion(root, "DTDVERSION", '2', "unsupported-dtd-version");
  Children children(root);
  const Node& content = children.expect({"MESSAGE", "DECLARATION"});
  children.end();
  if (content.name == "DECLARATION")
    failUnsupported("unsupported-operation", content, "a declaration is no request for an operation");
  return readMessage(content);
}

InstanceElement readInstance(std::string_view text, const Limits& limits) {
  const Node root = parseDocument(text, limits);
  if (root.name != "INSTANCE")
    failStructure(root.line, "expected INSTANCE, got " + root.name);
  return readInstanceElement(root);
}

}  // namespace cimom::xml
