// Operations on instances of a class, and on single instances.
#include <cimom/broker/Arena.h>
#include <cimom/protocol/Operations.h>
#include <cimom/xml/Conversion.h>

#include <utility>

namespace cimom::protocol {

namespace {

xml::InstanceOptions optionsOf(const Call& call, xml::InstanceForm form, const SchemaClass* requested) {
  xml::InstanceOptions options;
  options.form = form;
  options.location = call.location;
  options.requested = requested;
  options.localOnly = call.arguments.flag("LocalOnly");
  options.includeQualifiers = call.arguments.flag("IncludeQualifiers");
  options.includeClassOrigin = call.arguments.flag("IncludeClassOrigin");
  options.properties = call.arguments.propertyList();
  return options;
}

}  // namespace

Source instancesOfClass(Call& call, xml::InstanceForm form) {
  const SchemaClass& requested =
      call.schemaClass(call.arguments.className("ClassName"), CMPI_RC_ERR_INVALID_CLASS);
  xml::InstanceOptions options = optionsOf(call, form, &requested);
  options.deepInheritance = call.arguments.flag("DeepInheritance");
  return instanceSource(call.manager, std::move(options),
                        [&manager = call.manager, nameSpace = call.method.nameSpace, &requested,
                         properties = call.arguments.propertyList()](const InstanceSink& sink) {
                          return manager.enumerateInstances(nameSpace, requested.name(), properties, sink);
                        });
}

Source namesOfClass(Call& call, xml::PathForm form) {
  const SchemaClass& requested =
      call.schemaClass(call.arguments.className("ClassName"), CMPI_RC_ERR_INVALID_CLASS);
  return pathSource(
      form, call.location,
      [&manager = call.manager, nameSpace = call.method.nameSpace, &requested](const PathSink& sink) {
        return manager.enumerateInstanceNames(nameSpace, requested.name(), sink);
      });
}

Source queried(Call& call, xml::InstanceForm form) {
  const bool isOpen = call.method.parameter("FilterQuery") != nullptr;
  xml::InstanceOptions options;
  options.form = form;
  options.location = call.location;
  return instanceSource(
      call.manager, std::move(options),
      [&manager = call.manager, nameSpace = call.method.nameSpace,
       language = call.arguments.text(isOpen ? "FilterQueryLanguage" : "QueryLanguage"),
       query = call.arguments.text(isOpen ? "FilterQuery" : "Query")](const InstanceSink& sink) {
        return manager.execQuery(nameSpace, language, query, sink);
      });
}

void getInstance(Call& call) {
  const xml::ObjectName& name = call.arguments.object("InstanceName");
  const SchemaClass& requested = call.schemaClass(name.className, CMPI_RC_ERR_INVALID_CLASS);
  Arena arena;
  const ObjectPath& path = call.pathMaker(name)(arena);
  call.reply.keepTogether();
  const auto ask = [&](const InstanceSink& sink) {
    return call.manager.getInstance(path, call.arguments.propertyList(), sink);
  };
  answerWith(call,
             instanceSource(call.manager, optionsOf(call, xml::InstanceForm::instance, &requested), ask));
}

void createInstance(Call& call) {
  const xml::InstanceElement& element = call.arguments.instance("NewInstance");
  call.schemaClass(element.className, CMPI_RC_ERR_INVALID_CLASS);
  Arena arena;
  const Instance& instance =
      *xml::makeInstance(arena, call.manager.classTable(), element, call.method.nameSpace);
  call.reply.keepTogether();
  const auto ask = [&](const PathSink& sink) {
    return call.manager.createInstance(call.method.nameSpace, instance, sink);
  };
  answerWith(call, pathSource(xml::PathForm::instanceName, call.location, ask));
}

void modifyInstance(Call& call) {
  const xml::InstanceElement& element = call.arguments.instance("ModifiedInstance");
  call.schemaClass(element.className, CMPI_RC_ERR_INVALID_CLASS);
  Arena arena;
  const Instance& instance =
      *xml::makeInstance(arena, call.manager.classTable(), element, call.method.nameSpace);
  Call::require(call.manager.modifyInstance(instance, call.arguments.propertyList()));
  call.reply.succeedWithoutValue();
}

void deleteInstance(Call& call) {
  const xml::ObjectName& name = call.arguments.object("InstanceName");
  call.schemaClass(name.className, CMPI_RC_ERR_INVALID_CLASS);
  Arena arena;
  Call::require(call.manager.deleteInstance(call.pathMaker(name)(arena)));
  call.reply.succeedWithoutValue();
}

}  // namespace cimom::protocol
