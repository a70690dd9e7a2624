#include <agent/discovery/Discovery.h>
#include <agent/discovery/events/KernelEvents.h>
#include <agent/framework/InventoryFile.h>
#include <agent/framework/TreeSource.h>

#include <cstdlib>
#include <memory>

namespace agent {
namespace {

std::optional<std::filesystem::path> pathFromEnvironment(const char* name) {
  const char* value = std::getenv(name);
  if (value == nullptr || *value == '\0') {
    return std::nullopt;
  }
  return std::filesystem::path(value);
}

}  // namespace

TreeSource TreeSource::fromEnvironment() {
  return {pathFromEnvironment("ORU_INVENTORY"), pathFromEnvironment("ORU_SYSTEM_ROOT")};
}

NodeTree readTree(const TreeSource& source) {
  if (source.inventory) {
    return readInventoryFile(*source.inventory);
  }
  DiscoveryOptions options;
  if (source.systemRoot) {
    options.root = *source.systemRoot;
  }
  return discover(options);
}

std::unique_ptr<Events> eventsOf(const TreeSource& source) {
  if (!source.isLive()) {
    return nullptr;
  }
  return std::make_unique<discovery::KernelEvents>(discovery::kernelChannel());
}

}  // namespace agent
