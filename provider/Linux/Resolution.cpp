#include "Linux/Resolution.h"

namespace Oru::SoftwareInventoryProfileProvider {

std::optional<std::string> findKey(Moniker& moniker, const char* name) {
  const unsigned int count = moniker.getKeyCount();
  for (unsigned int index = 0; index < count; ++index) {
    if (!moniker.selectKey(index)) {
      continue;
    }
    std::string found;
    moniker.getName(found);
    if (found == name) {
      std::string value;
      moniker.getValue(value);
      return value;
    }
  }
  return std::nullopt;
}

Moniker monikerOf(const char* key, const std::string& value) {
  Moniker moniker;
  moniker.addKey(key, value);
  return moniker;
}

bool climbToComputer(Instrumentation& tree) {
  while (tree && tree.getSensorType() != NodeLexicon::ComputerSystemNode) {
    tree.selectNode(tree.getPathToParentNode());
  }
  return static_cast<bool>(tree);
}

}  // namespace Oru::SoftwareInventoryProfileProvider
