// The operations that the endpoint has: their names, their parameters, and what they do.
#pragma once

#include <cimom/protocol/Arguments.h>
#include <cimom/protocol/Call.h>

#include <span>
#include <string_view>

namespace cimom::protocol {

struct Operation {
  std::string_view name;
  std::span<const ParameterRule> parameters;
  /// Answers through the call's reply. Throws `CimError` and `xml::ConversionError`.
  void (*run)(Call& call);
};

/// nullptr for what is no intrinsic method of this endpoint. Names ignore case.
[[nodiscard]] const Operation* findOperation(std::string_view name);

// Sources that plain operations and open ones share. `form` is how the answer shows its objects.
[[nodiscard]] Source instancesOfClass(Call& call, xml::InstanceForm form);
[[nodiscard]] Source namesOfClass(Call& call, xml::PathForm form);
[[nodiscard]] Source associatorsOf(Call& call, xml::InstanceForm form);
[[nodiscard]] Source associatorNamesOf(Call& call, xml::PathForm form);
[[nodiscard]] Source referencesTo(Call& call, xml::InstanceForm form);
[[nodiscard]] Source referenceNamesTo(Call& call, xml::PathForm form);
[[nodiscard]] Source queried(Call& call, xml::InstanceForm form);

// The others.
void getClass(Call& call);
void enumerateClasses(Call& call);
void enumerateClassNames(Call& call);
void getInstance(Call& call);
void createInstance(Call& call);
void modifyInstance(Call& call);
void deleteInstance(Call& call);
void openQuery(Call& call);
void pullInstancesWithPath(Call& call);
void pullInstancePaths(Call& call);
void pullInstances(Call& call);
void closeEnumeration(Call& call);
void enumerationCount(Call& call);

}  // namespace cimom::protocol
