// Inventory files: a node tree as JSON, to show any machine from a file. docs/inventory-file.md describes
// them.
//
// Writing and reading give an equal tree with the same numbers. All operations are pure but for the one that
// opens a file, and may be called from any thread.
#pragma once

#include <agent/framework/NodeTree.h>

#include <cstddef>
#include <filesystem>
#include <stdexcept>
#include <string>
#include <string_view>

namespace agent {

/// What a file may hold at most, so that no file can exhaust a process.
struct InventoryBounds {
  static constexpr std::size_t bytes = std::size_t{256} << 20U;
  static constexpr std::size_t nodes = 1'000'000;
  static constexpr std::size_t depth = 64;  ///< of nodes below nodes; a root has depth 1
  static constexpr std::size_t propertiesOfNode = 256;
};

/// The file is no inventory. The message names the file, and where there are, the line and the field, and
/// says what was expected: `server.json:17: nodes[2].type: expected ..., got "Firmwar"`.
class InventoryError : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

/// Reads the text of an inventory file. `fileName` is for messages alone. Throws `InventoryError`.
NodeTree parseInventory(std::string_view json, std::string_view fileName);

/// Reads an inventory file. Throws `InventoryError`, also where the file cannot be opened or read, or is no
/// regular file: a pipe or a device is not waited for.
NodeTree readInventoryFile(const std::filesystem::path& path);

/// The text of an inventory file. Throws `InventoryError` where the tree is beyond the bounds.
std::string writeInventory(const NodeTree& tree);

}  // namespace agent
