// Reading texts out of CMPI objects.
#pragma once

#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>
#include <cmpi/cmpimacs.h>

#include <string>

namespace association_test {

inline std::string textOf(const CMPIString* text) {
  return text == nullptr ? "" : CMGetCharPtr(text);
}

inline std::string classOf(const CMPIObjectPath* path) {
  return textOf(CMGetClassName(path, nullptr));
}

inline std::string nameOf(const CMPIObjectPath* path) {
  CMPIStatus status{CMPI_RC_OK, nullptr};
  const CMPIData key = CMGetKey(path, "Name", &status);
  return status.rc == CMPI_RC_OK && key.type == CMPI_string ? textOf(key.value.string) : "";
}

}  // namespace association_test
