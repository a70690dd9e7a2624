// What the object manager tells of itself: the instances of its interop namespace.
#pragma once

#include <cimom/mof/Declarations.h>

#include <span>
#include <string>
#include <vector>

namespace cimom {

struct InteropSettings {
  std::string nameSpace = "root/interop";
  std::string otherName = "interop";  ///< under which the namespace is found as well; empty: none
  /// The system that the object manager runs on. Empty: this host's name.
  std::string systemName = {};
  std::string systemClass = "CIM_ComputerSystem";
  /// The object manager's key, one for each of a network. Empty: "cimom:" and the system's name.
  std::string name = {};
  std::string elementName = "cimom";  ///< for people
  std::string description = "A CIM object manager.";
  std::string version = {};  ///< goes after the description; empty: none
};

/// A CIM_ObjectManager, and a CIM_Namespace for each of the namespaces.
[[nodiscard]] std::vector<mof::InstanceDeclaration> hostInstances(const InteropSettings& settings,
                                                                  std::span<const std::string> nameSpaces);

}  // namespace cimom
