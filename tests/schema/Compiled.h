// The schema as it is laid out for object managers, compiled as one of them does it.
#pragma once

#include <cimom/mof/ClassRepository.h>

#include <filesystem>

inline const std::filesystem::path& schemaFolder() {
  static const std::filesystem::path folder = SCHEMA_FOLDER;
  return folder;
}

/// The part of the CIM schema first, then this system's classes in the order that they need.
inline cimom::ClassRepository compiledSchema() {
  cimom::ClassRepository classes;
  for (const char* file : {"CIM_Core.mof", "CIM_Software.mof", "CIM_System.mof", "CIM_Device.mof",
                           "KELVO_Endpoints.mof", "KELVO_SoftwareInventory.mof"})
    classes.compileFile(schemaFolder() / file);
  classes.checkReferences();
  return classes;
}
