// Where the node tree comes from, and the one tree that every cursor of the process shares.
#pragma once

#include <agent/framework/NodeTree.h>

#include <filesystem>
#include <memory>
#include <optional>

namespace agent {

/// An inventory file, a system root, or (with neither) the live machine.
struct TreeSource {
  std::optional<std::filesystem::path> inventory;  ///< `ORU_INVENTORY`; goes before the system root
  std::optional<std::filesystem::path>
      systemRoot;  ///< `ORU_SYSTEM_ROOT`: a folder that holds sys/, proc/, lib/

  /// The source that the environment names. A variable that is set but empty counts as not set.
  static TreeSource fromEnvironment();
};

/// Reads the tree of `source`. Throws `std::runtime_error` (with the file, the line and the field, where
/// there are) when an inventory file cannot be read; a machine can always be read, if only to say in the
/// reports what could not be. Defined beside the framework, where discovery is at hand.
NodeTree readTree(const TreeSource& source);

}  // namespace agent
