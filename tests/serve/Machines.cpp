#include "Machines.h"

#include <fstream>

namespace serve_test {

std::string bigInventory(std::size_t firmware, const std::string& version) {
  std::string text = R"({"format": "swinv-inventory", "version": 1, "nodes": [{"type": "ComputerSystem",
    "position": "computer", "description": "Computer System", "properties": {"Name": "atlas"}, "children": [)";
  for (std::size_t i = 0; i < firmware; ++i) {
    text += i == 0 ? "" : ",";
    text += R"({"type": "Firmware", "position": "part/)" + std::to_string(i) +
            R"(", "description": "Firmware", "properties": {"Name": "Part )" + std::to_string(i) +
            R"(", "Manufacturer": "Norvane", "VersionString": ")" + version + "\"}}\n";
  }
  return text + "]}]}";
}

InventoryFile::InventoryFile(const std::string& text) {
  replace(text);
}

void InventoryFile::replace(const std::string& text) const {
  std::ofstream(path()) << text;
}

}  // namespace serve_test
