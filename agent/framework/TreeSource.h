// Where the node tree comes from, and the one tree that every cursor of the process shares.
#pragma once

#include <agent/framework/Events.h>
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

  /// Whether this is the machine that the process runs on.
  [[nodiscard]] bool isLive() const { return !inventory && !systemRoot; }
};

/// Reads the tree of `source`. Throws `std::runtime_error` (with the file, the line and the field, where
/// there are) when an inventory file cannot be read; a machine can always be read, if only to say in the
/// reports what could not be. Defined beside the framework, where discovery is at hand.
NodeTree readTree(const TreeSource& source);

/// What tells when `source` changes; null where nothing does, as only a live machine has events. Opens
/// nothing that could last: that is left to the first wait. Throws `std::system_error` where the process has
/// no descriptor left. Defined beside `readTree`.
std::unique_ptr<Events> eventsOf(const TreeSource& source);

}  // namespace agent
