#include <agent/framework/InventoryFile.h>

#include "Fuzzer.h"

// What is read can be written, and reads as the same again.
void fuzz::tryOne(std::string_view input) {
  try {
    const std::string written = agent::writeInventory(agent::parseInventory(input, "input.json"));
    promise(agent::writeInventory(agent::parseInventory(written, "written.json")) == written,
            "an inventory that was written reads as another");
  } catch (const agent::InventoryError&) {
  }
}
