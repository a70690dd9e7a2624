#include <cimom/broker/Arena.h>
#include <cimom/broker/ClassTable.h>
#include <cimom/broker/WbemUri.h>
#include <cimom/mof/ClassRepository.h>

#include "Fuzzer.h"

namespace {

constexpr std::string_view schema = R"(
Qualifier Key : boolean = false, Scope(property, reference);
Qualifier Association : boolean = false, Scope(association);
class Thing { [Key] string Name; [Key] uint16 Number; [Key] boolean Flag; [Key] datetime When; [Key] char16 Letter;
              [Key] real64 Size; };
[Association] class Tie { [Key] Thing REF Left; [Key] Thing REF Right; };
)";

cimom::ClassRepository compiled() {
  cimom::ClassRepository repository;
  repository.compileText(schema, "schema.mof");
  return repository;
}

}  // namespace

// A path prints as a text that reads as the same path.
void fuzz::tryOne(std::string_view input) {
  static const cimom::ClassRepository repository = compiled();
  static const cimom::ClassTable classes(repository);
  cimom::Arena arena;
  try {
    const cimom::ObjectPath* path = cimom::parseWbemUri(arena, classes, input, "root/cimv2");
    const std::string text = cimom::formatWbemUri(*path);
    const cimom::ObjectPath* again = cimom::parseWbemUri(arena, classes, text);
    promise(cimom::formatWbemUri(*again) == text, "a path that was printed reads as another");
  } catch (const cimom::WbemUriError&) {
  }
}
