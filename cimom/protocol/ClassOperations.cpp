// Operations on classes. Every namespace has all of them.
#include <cimom/protocol/Operations.h>

#include <vector>

namespace cimom::protocol {

namespace {

xml::ClassOptions optionsOf(const Call& call) {
  xml::ClassOptions options;
  options.localOnly = call.arguments.flag("LocalOnly");
  options.includeQualifiers = call.arguments.flag("IncludeQualifiers");
  options.includeClassOrigin = call.arguments.flag("IncludeClassOrigin");
  options.properties = call.arguments.propertyList();
  return options;
}

/// Below the class that is named, or from the top: the next level, or all of them. Superclasses come first.
std::vector<const SchemaClass*> subclasses(const Call& call) {
  const bool isDeep = call.arguments.flag("DeepInheritance");
  const std::string name = call.arguments.className("ClassName");
  if (!name.empty()) {
    const SchemaClass& top = call.schemaClass(name, CMPI_RC_ERR_INVALID_CLASS);
    if (!isDeep)
      return top.subclasses;
    std::vector<const SchemaClass*> all = ClassRepository::withSubclasses(top);
    all.erase(all.begin());
    return all;
  }
  std::vector<const SchemaClass*> found;
  for (const SchemaClass* each : call.manager.classes().all()) {
    if (isDeep || each->superclass == nullptr)
      found.push_back(each);
  }
  return found;
}

template <class Append>
void answerEach(Call& call, const Append& append) {
  for (const SchemaClass* each : subclasses(call)) {
    append(call.reply.object(), *each);
    if (!call.reply.objectDone())
      return;
  }
  call.reply.succeed();
}

}  // namespace

void getClass(Call& call) {
  const SchemaClass& which = call.schemaClass(call.arguments.className("ClassName"), CMPI_RC_ERR_NOT_FOUND);
  call.reply.keepTogether();
  xml::appendClass(call.reply.object(), call.manager.classes(), which, optionsOf(call));
  call.reply.objectDone();
  call.reply.succeed();
}

void enumerateClasses(Call& call) {
  const xml::ClassOptions options = optionsOf(call);
  answerEach(call, [&](std::string& out, const SchemaClass& each) {
    xml::appendClass(out, call.manager.classes(), each, options);
  });
}

void enumerateClassNames(Call& call) {
  answerEach(call, [](std::string& out, const SchemaClass& each) { xml::appendClassName(out, each.name()); });
}

}  // namespace cimom::protocol
