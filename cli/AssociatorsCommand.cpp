#include <cimom/Names.h>
#include <cli/CimRows.h>
#include <cli/CimStatus.h>
#include <cli/ClassWriter.h>
#include <cli/Commands.h>
#include <cli/Messages.h>
#include <cli/ObjectArgument.h>
#include <cli/Progress.h>
#include <cli/Session.h>
#include <cli/Text.h>

#include <algorithm>
#include <string>
#include <vector>

namespace cli {
namespace {

using cimom::SchemaClass;

const SchemaClass* classOrAny(const Session& session, const std::string& name) {
  return name.empty() ? nullptr : &session.classNamed(name);
}

/// All association classes at or below `top`; of the whole schema where none is given.
std::vector<const SchemaClass*> associationsBelow(const Session& session, const SchemaClass* top) {
  std::vector<const SchemaClass*> classes;
  for (const SchemaClass* each : session.manager().classes().all()) {
    if (each->isAssociation() && (top == nullptr || each->isA(*top))) {
      classes.push_back(each);
    }
  }
  return classes;
}

void checkAssociation(const Session& session, const SchemaClass* info) {
  if (info == nullptr || info->isAssociation()) {
    return;
  }
  std::string names;
  for (const SchemaClass* each : associationsBelow(session, nullptr)) {
    if (!each->isAbstract()) {
      names.append(names.empty() ? "" : ", ").append(each->name());
    }
  }
  throw CommandError(statusName(CMPI_RC_ERR_INVALID_PARAMETER) + ": --assoc-class " + info->name() +
                     " is no association; there are " + names);
}

/// A role that no association has would silently leave nothing.
void checkRole(const char* option, const std::string& role,
               const std::vector<const SchemaClass*>& associations) {
  std::vector<std::string> known;
  std::string names;
  for (const SchemaClass* association : associations) {
    for (const auto& property : association->properties) {
      if (property.isReference() && std::find(known.begin(), known.end(), property.name) == known.end()) {
        known.push_back(property.name);
        names.append(names.empty() ? "" : ", ").append(property.name);
      }
    }
  }
  const bool found = std::any_of(known.begin(), known.end(),
                                 [&role](const std::string& name) { return cimom::sameName(name, role); });
  if (role.empty() || found) {
    return;
  }
  const auto nearest = nearestName(role, known);
  throw CommandError(statusName(CMPI_RC_ERR_INVALID_PARAMETER) + ": " + option + ": no association has a '" +
                     role + "'" + (nearest ? "; did you mean " + *nearest + "?" : "; there are " + names));
}

cimom::AssociationQuery queryOf(const Session& session, const Options& options) {
  const SchemaClass* association = classOrAny(session, options.associationClass);
  checkAssociation(session, association);
  const auto associations = associationsBelow(session, association);
  checkRole("--role", options.role, associations);
  checkRole("--result-role", options.resultRole, associations);
  return {options.associationClass, options.resultClass, options.role, options.resultRole};
}

cimom::PropertyList wanted(const Options& options) {
  return options.properties.empty() ? cimom::PropertyList() : options.properties;
}

/// Providers answer alike for an object that belongs to nothing and for one that is not there.
void tellApart(const Session& session, const std::string& path, cimom::Outcome& outcome) {
  if (outcome.status.code == CMPI_RC_OK && outcome.delivered == 0) {
    const cimom::Outcome object = session.manager().getInstance(path, std::vector<std::string>{},
                                                                [](const cimom::Instance&) { return true; });
    if (object.status.code == CMPI_RC_ERR_NOT_FOUND) {
      outcome = object;
    }
  }
}

}  // namespace

void runAssociators(const Options& options, Output& output) {
  Session session(options);
  const std::string what = "associators " + options.object;
  const cimom::AssociationQuery query = queryOf(session, options);
  const auto classes = session.publishedClasses(classOrAny(session, options.resultClass));
  const auto writer = makeClassWriter(classes, options, output);
  Progress progress("Asking for what belongs to " + options.object);
  const NamedObject object = namedObject(session, options.object, what);
  const auto write = [&](const auto& each) {
    progress.stop();
    const SchemaClass& info = session.classNamed(std::string(each.className()));
    writer->write(info, rowOf(each, writer->columnsOf(info)));
    return output.error() == 0;
  };
  cimom::Outcome outcome = options.namesOnly
                               ? session.manager().associatorNames(object.path, query, write)
                               : session.manager().associators(object.path, query, wanted(options), write);
  tellApart(session, object.path, outcome);
  progress.stop();
  session.conclude(outcome, what, *writer, output);
}

}  // namespace cli
