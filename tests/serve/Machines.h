// Machines of any size, as inventory files.
#pragma once

#include "../cli/Process.h"

#include <cstddef>
#include <string>

namespace serve_test {

/// A computer "atlas" with so many firmware elements, each described "Firmware".
std::string bigInventory(std::size_t firmware, const std::string& version = "1.0");

/// An inventory file of a test's own, gone with it.
class InventoryFile {
 public:
  explicit InventoryFile(const std::string& text);

  [[nodiscard]] std::string path() const { return folder_.at("machine.json").string(); }
  void replace(const std::string& text) const;

 private:
  cli_test::TemporaryFolder folder_;
};

}  // namespace serve_test
