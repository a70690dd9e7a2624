// MOF texts for tests.
#pragma once

#include <cimom/mof/ClassRepository.h>

#include <string>
#include <string_view>

namespace mof_test {

inline constexpr std::string_view qualifiers = R"(
qualifier Abstract : boolean = false, Scope(class), Flavor(Restricted);
qualifier Association : boolean = false, Scope(association), Flavor(DisableOverride);
qualifier Description : string, Scope(any), Flavor(Translatable);
qualifier Key : boolean = false, Scope(property, reference), Flavor(DisableOverride);
qualifier MaxLen : uint32 = 8, Scope(property);
qualifier Override : string, Scope(property, reference, method), Flavor(Restricted);
qualifier Values : string[], Scope(property);
qualifier Version : string, Scope(class), Flavor(Restricted);
)";

/// A repository with the qualifiers above and a text, which `text.mof` stands for in messages.
inline cimom::ClassRepository compiled(std::string_view text) {
  cimom::ClassRepository repository;
  repository.compileText(qualifiers, "qualifiers.mof");
  repository.compileText(text, "text.mof");
  return repository;
}

/// What compiling the text complains about; empty where it does not.
inline std::string complaint(std::string_view text) {
  try {
    compiled(text).checkReferences();
  } catch (const cimom::MofError& error) {
    return error.what();
  }
  return {};
}

}  // namespace mof_test
