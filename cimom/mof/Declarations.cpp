#include <cimom/Names.h>
#include <cimom/mof/Declarations.h>

#include <algorithm>

namespace cimom::mof {

const Qualifier* findQualifier(const Qualifiers& qualifiers, std::string_view name) {
  const auto found = std::find_if(qualifiers.begin(), qualifiers.end(),
                                  [name](const Qualifier& each) { return sameName(each.name, name); });
  return found == qualifiers.end() ? nullptr : &*found;
}

bool isTrue(const Qualifiers& qualifiers, std::string_view name) {
  const Qualifier* found = findQualifier(qualifiers, name);
  return found != nullptr && !found->value.isArray && found->value.elements.front() == Scalar(true);
}

std::string_view textOf(const Qualifiers& qualifiers, std::string_view name) {
  const Qualifier* found = findQualifier(qualifiers, name);
  if (found == nullptr || found->value.isArray)
    return {};
  const auto* text = std::get_if<std::string>(&found->value.elements.front());
  return text == nullptr ? std::string_view() : std::string_view(*text);
}

bool QualifierDeclaration::toSubclass() const {
  return std::none_of(flavors.begin(), flavors.end(),
                      [](const std::string& flavor) { return sameName(flavor, "Restricted"); });
}

}  // namespace cimom::mof
