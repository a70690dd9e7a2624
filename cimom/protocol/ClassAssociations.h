// Associations between classes, as the schema declares them.
#pragma once

#include <cimom/ObjectManager.h>
#include <cimom/mof/ClassRepository.h>

#include <vector>

namespace cimom::protocol {

/// The association classes with a reference that objects of `start` can stand in: one to the class, or to an
/// ancestor of it. `query.associationClass` and `query.role` narrow. In the order of the schema.
[[nodiscard]] std::vector<const SchemaClass*> referenceClasses(const ClassRepository& classes,
                                                               const SchemaClass& start,
                                                               const AssociationQuery& query);

/// The classes that the other references of these associations are declared with, each once. All of `query`
/// narrows: the result class is `query.resultClass` or descends from it.
[[nodiscard]] std::vector<const SchemaClass*> associatorClasses(const ClassRepository& classes,
                                                                const SchemaClass& start,
                                                                const AssociationQuery& query);

}  // namespace cimom::protocol
