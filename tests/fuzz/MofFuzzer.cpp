#include <cimom/mof/ClassRepository.h>
#include <cimom/mof/MofError.h>

#include "Fuzzer.h"

void fuzz::tryOne(std::string_view input) {
  cimom::ClassRepository repository;
  try {
    repository.compileText(input, "input.mof");
    repository.checkReferences();
  } catch (const cimom::MofError&) {
  }
}
