#include <cimom/Names.h>
#include <cimom/protocol/Operations.h>

#include <algorithm>
#include <iterator>

namespace cimom::protocol {

namespace {

using Kind = ParameterKind;
using xml::InstanceForm;
using xml::PathForm;

template <auto makeSource, auto form>
void answer(Call& call) {
  answerWith(call, makeSource(call, form));
}

template <auto makeSource, auto form, Pulled pulled>
void open(Call& call) {
  openWith(call, pulled, makeSource(call, form));
}

template <auto makeSource>
constexpr auto openInstances = open<makeSource, InstanceForm::instanceWithPath, Pulled::instancesWithPath>;
template <auto makeSource>
constexpr auto openPaths = open<makeSource, PathForm::instancePath, Pulled::paths>;

// --- Parameters. Flags are required nowhere; where one is true when it is not given, its rule says so.

constexpr ParameterRule localOnly{"LocalOnly", Kind::flag, false, true};
// In instances the standard lets servers take its default, true, for false, and advises clients against true:
// it would leave out all that a class inherits. Who asks for it gets it.
constexpr ParameterRule instanceLocalOnly{"LocalOnly", Kind::flag};
constexpr ParameterRule deepInheritance{"DeepInheritance", Kind::flag, false, true};
constexpr ParameterRule shallowInheritance{"DeepInheritance", Kind::flag};
constexpr ParameterRule withQualifiers{"IncludeQualifiers", Kind::flag, false, true};
constexpr ParameterRule withoutQualifiers{"IncludeQualifiers", Kind::flag};
constexpr ParameterRule classOrigin{"IncludeClassOrigin", Kind::flag};
constexpr ParameterRule propertyList{"PropertyList", Kind::propertyList};
constexpr ParameterRule className{"ClassName", Kind::className, true};
constexpr ParameterRule anyClassName{"ClassName", Kind::className};
constexpr ParameterRule instanceName{"InstanceName", Kind::instanceName, true};
constexpr ParameterRule objectName{"ObjectName", Kind::objectName, true};
constexpr ParameterRule assocClass{"AssocClass", Kind::className};
constexpr ParameterRule resultClass{"ResultClass", Kind::className};
constexpr ParameterRule role{"Role", Kind::text};
constexpr ParameterRule resultRole{"ResultRole", Kind::text};
constexpr ParameterRule filterLanguage{"FilterQueryLanguage", Kind::text};
constexpr ParameterRule filter{"FilterQuery", Kind::text};
constexpr ParameterRule timeout{"OperationTimeout", Kind::number};
constexpr ParameterRule continueOnError{"ContinueOnError", Kind::flag};
constexpr ParameterRule maximum{"MaxObjectCount", Kind::number};
constexpr ParameterRule requiredMaximum{"MaxObjectCount", Kind::number, true};
constexpr ParameterRule context{"EnumerationContext", Kind::text, true};

constexpr ParameterRule getClassRules[] = {className, localOnly, withQualifiers, classOrigin, propertyList};
constexpr ParameterRule classesRules[] = {anyClassName, shallowInheritance, localOnly, withQualifiers,
                                          classOrigin};
constexpr ParameterRule classNamesRules[] = {anyClassName, shallowInheritance};
constexpr ParameterRule getInstanceRules[] = {instanceName, instanceLocalOnly, withoutQualifiers, classOrigin,
                                              propertyList};
constexpr ParameterRule instancesRules[] = {className,         instanceLocalOnly, deepInheritance,
                                            withoutQualifiers, classOrigin,       propertyList};
constexpr ParameterRule namesRules[] = {className};
constexpr ParameterRule associatorsRules[] = {objectName, assocClass,        resultClass, role,
                                              resultRole, withoutQualifiers, classOrigin, propertyList};
constexpr ParameterRule associatorNamesRules[] = {objectName, assocClass, resultClass, role, resultRole};
constexpr ParameterRule referencesRules[] = {objectName,        resultClass, role,
                                             withoutQualifiers, classOrigin, propertyList};
constexpr ParameterRule referenceNamesRules[] = {objectName, resultClass, role};
constexpr ParameterRule createRules[] = {{"NewInstance", Kind::newInstance, true}};
constexpr ParameterRule modifyRules[] = {
    {"ModifiedInstance", Kind::modifiedInstance, true}, withQualifiers, propertyList};
constexpr ParameterRule deleteRules[] = {instanceName};
constexpr ParameterRule queryRules[] = {{"QueryLanguage", Kind::text, true}, {"Query", Kind::text, true}};

constexpr ParameterRule openInstancesRules[] = {className,    deepInheritance, classOrigin,
                                                propertyList, filterLanguage,  filter,
                                                timeout,      continueOnError, maximum};
constexpr ParameterRule openPathsRules[] = {className, filterLanguage,  filter,
                                            timeout,   continueOnError, maximum};
constexpr ParameterRule openReferencesRules[] = {instanceName,    resultClass,    role,   classOrigin,
                                                 propertyList,    filterLanguage, filter, timeout,
                                                 continueOnError, maximum};
constexpr ParameterRule openReferencePathsRules[] = {
    instanceName, resultClass, role, filterLanguage, filter, timeout, continueOnError, maximum};
constexpr ParameterRule openAssociatorsRules[] = {instanceName, assocClass,  resultClass,     role,
                                                  resultRole,   classOrigin, propertyList,    filterLanguage,
                                                  filter,       timeout,     continueOnError, maximum};
constexpr ParameterRule openAssociatorPathsRules[] = {instanceName,    assocClass,     resultClass, role,
                                                      resultRole,      filterLanguage, filter,      timeout,
                                                      continueOnError, maximum};
constexpr ParameterRule openQueryRules[] = {{"FilterQuery", Kind::text, true},
                                            {"FilterQueryLanguage", Kind::text, true},
                                            {"ReturnQueryResultClass", Kind::flag},
                                            timeout,
                                            continueOnError,
                                            maximum};
constexpr ParameterRule pullRules[] = {context, requiredMaximum};
constexpr ParameterRule contextRules[] = {context};

constexpr Operation operations[] = {
    {"GetClass", getClassRules, getClass},
    {"EnumerateClasses", classesRules, enumerateClasses},
    {"EnumerateClassNames", classNamesRules, enumerateClassNames},
    {"GetInstance", getInstanceRules, getInstance},
    {"EnumerateInstances", instancesRules, answer<instancesOfClass, InstanceForm::namedInstance>},
    {"EnumerateInstanceNames", namesRules, answer<namesOfClass, PathForm::instanceName>},
    {"Associators", associatorsRules, answer<associatorsOf, InstanceForm::objectWithPath>},
    {"AssociatorNames", associatorNamesRules, answer<associatorNamesOf, PathForm::objectPath>},
    {"References", referencesRules, answer<referencesTo, InstanceForm::objectWithPath>},
    {"ReferenceNames", referenceNamesRules, answer<referenceNamesTo, PathForm::objectPath>},
    {"CreateInstance", createRules, createInstance},
    {"ModifyInstance", modifyRules, modifyInstance},
    {"DeleteInstance", deleteRules, deleteInstance},
    {"ExecQuery", queryRules, answer<queried, InstanceForm::object>},
    {"OpenEnumerateInstances", openInstancesRules, openInstances<instancesOfClass>},
    {"OpenEnumerateInstancePaths", openPathsRules, openPaths<namesOfClass>},
    {"OpenReferenceInstances", openReferencesRules, openInstances<referencesTo>},
    {"OpenReferenceInstancePaths", openReferencePathsRules, openPaths<referenceNamesTo>},
    {"OpenAssociatorInstances", openAssociatorsRules, openInstances<associatorsOf>},
    {"OpenAssociatorInstancePaths", openAssociatorPathsRules, openPaths<associatorNamesOf>},
    {"OpenQueryInstances", openQueryRules, openQuery},
    {"PullInstancesWithPath", pullRules, pullInstancesWithPath},
    {"PullInstancePaths", pullRules, pullInstancePaths},
    {"PullInstances", pullRules, pullInstances},
    {"CloseEnumeration", contextRules, closeEnumeration},
    {"EnumerationCount", contextRules, enumerationCount},
};

}  // namespace

const Operation* findOperation(std::string_view name) {
  const auto* found = std::find_if(std::begin(operations), std::end(operations),
                                   [name](const Operation& each) { return sameName(each.name, name); });
  return found == std::end(operations) ? nullptr : found;
}

}  // namespace cimom::protocol
