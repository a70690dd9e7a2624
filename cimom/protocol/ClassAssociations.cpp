#include <cimom/Names.h>
#include <cimom/protocol/ClassAssociations.h>

#include <algorithm>

namespace cimom::protocol {

namespace {

bool isWanted(const std::string& wanted, const std::string& name) {
  return wanted.empty() || sameName(wanted, name);
}

bool isBelow(const ClassRepository& classes, const SchemaClass& which, const std::string& ancestor) {
  return ancestor.empty() || classes.isA(which.name(), ancestor);
}

/// Whether objects of `start` can stand in the reference.
bool holds(const ClassRepository& classes, const mof::Property& reference, const SchemaClass& start,
           const std::string& role) {
  return reference.isReference() && isWanted(role, reference.name) &&
         classes.isA(start.name(), reference.referenceClass);
}

std::vector<const mof::Property*> holders(const ClassRepository& classes, const SchemaClass& association,
                                          const SchemaClass& start, const std::string& role) {
  std::vector<const mof::Property*> found;
  for (const mof::Property& property : association.properties) {
    if (holds(classes, property, start, role))
      found.push_back(&property);
  }
  return found;
}

}  // namespace

std::vector<const SchemaClass*> referenceClasses(const ClassRepository& classes, const SchemaClass& start,
                                                 const AssociationQuery& query) {
  std::vector<const SchemaClass*> found;
  for (const SchemaClass* each : classes.all()) {
    if (each->isAssociation() && isBelow(classes, *each, query.associationClass) &&
        !holders(classes, *each, start, query.role).empty())
      found.push_back(each);
  }
  return found;
}

std::vector<const SchemaClass*> associatorClasses(const ClassRepository& classes, const SchemaClass& start,
                                                  const AssociationQuery& query) {
  std::vector<const SchemaClass*> found;
  for (const SchemaClass* association : referenceClasses(classes, start, query)) {
    const std::vector<const mof::Property*> ends = holders(classes, *association, start, query.role);
    for (const mof::Property& other : association->properties) {
      // Where objects of the class can stand in both references, each is the other's far end.
      const bool hasNearEnd =
          std::any_of(ends.begin(), ends.end(), [&other](const auto* near) { return near != &other; });
      const SchemaClass* end = other.isReference() ? classes.find(other.referenceClass) : nullptr;
      if (hasNearEnd && end != nullptr && isWanted(query.resultRole, other.name) &&
          isBelow(classes, *end, query.resultClass) &&
          std::find(found.begin(), found.end(), end) == found.end())
        found.push_back(end);
    }
  }
  return found;
}

}  // namespace cimom::protocol
