// Operations that follow associations: from an instance, or from a class through what the schema declares.
#include <cimom/broker/Arena.h>
#include <cimom/protocol/ClassAssociations.h>
#include <cimom/protocol/Operations.h>
#include <cimom/xml/Conversion.h>

#include <utility>

namespace cimom::protocol {

namespace {

/// Where an association request starts: plain operations take classes too, and call it otherwise.
const xml::ObjectName& startOf(const Call& call) {
  const bool isPlain = call.method.parameter("ObjectName") != nullptr;
  return call.arguments.object(isPlain ? "ObjectName" : "InstanceName");
}

AssociationQuery associatorQuery(const Call& call) {
  return {call.arguments.className("AssocClass"), call.arguments.className("ResultClass"),
          call.arguments.text("Role"), call.arguments.text("ResultRole")};
}

/// The class that references are of is the one of the associations themselves.
AssociationQuery referenceQuery(const Call& call) {
  return {call.arguments.className("ResultClass"), "", call.arguments.text("Role"), ""};
}

using Classes = std::vector<const SchemaClass*>;
using FindClasses = Classes (*)(const ClassRepository&, const SchemaClass&, const AssociationQuery&);

/// The classes that associations tie to a class, as the schema declares them. Throws `CimError` for names
/// that the schema lacks.
Classes classesFrom(const Call& call, FindClasses find, const AssociationQuery& query) {
  const SchemaClass& start = call.schemaClass(startOf(call).className, CMPI_RC_ERR_INVALID_PARAMETER);
  for (const std::string& name : {query.associationClass, query.resultClass}) {
    if (!name.empty())
      call.schemaClass(name, CMPI_RC_ERR_INVALID_PARAMETER);
  }
  return find(call.manager.classes(), start, query);
}

template <class Append>
Source classSource(Classes classes, Append append) {
  return [classes = std::move(classes), append = std::move(append)](ObjectSink& sink) {
    Outcome outcome{{CMPI_RC_OK, ""}, true, 0};
    for (const SchemaClass* each : classes) {
      append(sink.object(), *each);
      ++outcome.delivered;
      if (!sink.objectDone())
        break;
    }
    return outcome;
  };
}

Source associatedClasses(const Call& call, FindClasses find, const AssociationQuery& query) {
  xml::ClassOptions options;
  options.localOnly = false;
  options.includeQualifiers = call.arguments.flag("IncludeQualifiers");
  options.includeClassOrigin = call.arguments.flag("IncludeClassOrigin");
  options.properties = call.arguments.propertyList();
  return classSource(classesFrom(call, find, query),
                     [&classes = call.manager.classes(), options, location = call.location](
                         std::string& out, const SchemaClass& each) {
                       xml::appendClassWithPath(out, classes, each, options, location);
                     });
}

Source associatedClassPaths(const Call& call, FindClasses find, const AssociationQuery& query) {
  return classSource(classesFrom(call, find, query),
                     [location = call.location](std::string& out, const SchemaClass& each) {
                       xml::appendClassObjectPath(out, each.name(), location);
                     });
}

using AskInstances = Outcome (ObjectManager::*)(const ObjectPath&, const AssociationQuery&,
                                                const PropertyList&, const InstanceSink&);
using AskPaths = Outcome (ObjectManager::*)(const ObjectPath&, const AssociationQuery&, const PathSink&);

/// The path is made anew whenever the source runs, because it lives in an arena of its own.
Source associatedInstances(const Call& call, xml::InstanceForm form, AskInstances ask,
                           const AssociationQuery& query) {
  xml::InstanceOptions options;
  options.form = form;
  options.location = call.location;
  options.includeQualifiers = call.arguments.flag("IncludeQualifiers");
  options.includeClassOrigin = call.arguments.flag("IncludeClassOrigin");
  options.properties = call.arguments.propertyList();
  return instanceSource(call.manager, std::move(options),
                        [&manager = call.manager, ask, query, start = call.pathMaker(startOf(call)),
                         properties = call.arguments.propertyList()](const InstanceSink& sink) {
                          Arena arena;
                          return (manager.*ask)(start(arena), query, properties, sink);
                        });
}

Source associatedPaths(const Call& call, xml::PathForm form, AskPaths ask, const AssociationQuery& query) {
  return pathSource(
      form, call.location,
      [&manager = call.manager, ask, query, start = call.pathMaker(startOf(call))](const PathSink& sink) {
        Arena arena;
        return (manager.*ask)(start(arena), query, sink);
      });
}

}  // namespace

Source associatorsOf(Call& call, xml::InstanceForm form) {
  if (startOf(call).isInstance)
    return associatedInstances(call, form, &ObjectManager::associators, associatorQuery(call));
  return associatedClasses(call, associatorClasses, associatorQuery(call));
}

Source associatorNamesOf(Call& call, xml::PathForm form) {
  if (startOf(call).isInstance)
    return associatedPaths(call, form, &ObjectManager::associatorNames, associatorQuery(call));
  return associatedClassPaths(call, associatorClasses, associatorQuery(call));
}

Source referencesTo(Call& call, xml::InstanceForm form) {
  if (startOf(call).isInstance)
    return associatedInstances(call, form, &ObjectManager::references, referenceQuery(call));
  return associatedClasses(call, referenceClasses, referenceQuery(call));
}

Source referenceNamesTo(Call& call, xml::PathForm form) {
  if (startOf(call).isInstance)
    return associatedPaths(call, form, &ObjectManager::referenceNames, referenceQuery(call));
  return associatedClassPaths(call, referenceClasses, referenceQuery(call));
}

}  // namespace cimom::protocol
