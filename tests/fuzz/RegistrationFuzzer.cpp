#include <cimom/ProviderRegistration.h>

#include "Fuzzer.h"

void fuzz::tryOne(std::string_view input) {
  try {
    for (const cimom::ProviderRegistration& each : cimom::parseRegistrations(input, "input.reg")) {
      promise(!each.className.empty() && !each.nameSpaces.empty(),
              "a registration without class or namespace");
    }
  } catch (const cimom::RegistrationError&) {
  }
}
