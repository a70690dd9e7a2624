#include <cimom/Names.h>
#include <cimom/protocol/Call.h>
#include <cimom/xml/Conversion.h>

#include <utility>

namespace cimom::protocol {

const SchemaClass& Call::schemaClass(std::string_view name, CMPIrc code) const {
  const SchemaClass* found = manager.classes().find(name);
  if (found == nullptr)
    throw CimError(code, "there is no class " + std::string(name));
  return *found;
}

std::function<const ObjectPath&(Arena&)> Call::pathMaker(const xml::ObjectName& name) const {
  if (!name.nameSpace.empty() && !sameName(name.nameSpace, method.nameSpace))
    throw CimError(CMPI_RC_ERR_INVALID_PARAMETER, "the object is in the namespace " + name.nameSpace +
                                                      ", the request in " + method.nameSpace);
  return [name, &classes = manager.classTable(), nameSpace = method.nameSpace](
             Arena& arena) -> const ObjectPath& { return *xml::makePath(arena, classes, name, nameSpace); };
}

void Call::require(const Outcome& outcome) {
  if (outcome.status.code != CMPI_RC_OK)
    throw CimError(outcome.status.code, outcome.status.description);
}

Source instanceSource(ObjectManager& manager, xml::InstanceOptions options,
                      std::function<Outcome(const InstanceSink&)> ask) {
  return [&manager, options = std::move(options), ask = std::move(ask)](ObjectSink& sink) {
    xml::InstanceWriter writer(manager.classes(), options);
    return ask([&](const Instance& instance) {
      writer.append(sink.object(), instance);
      return sink.objectDone();
    });
  };
}

Source pathSource(xml::PathForm form, xml::Location location, std::function<Outcome(const PathSink&)> ask) {
  return [form, location = std::move(location), ask = std::move(ask)](ObjectSink& sink) {
    xml::PathWriter writer(form, location);
    return ask([&](const ObjectPath& path) {
      writer.append(sink.object(), path);
      return sink.objectDone();
    });
  };
}

void answerWith(Call& call, const Source& source) {
  Call::require(source(call.reply));
  call.reply.succeed();
}

}  // namespace cimom::protocol
