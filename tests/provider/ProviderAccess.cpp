#include "ProviderAccess.h"

#include <new>

namespace {

constexpr int nameId = 108;
constexpr int versionId = 307;
constexpr int driverVersionId = 134;
constexpr int releaseDateId = 164;

std::vector<std::string> keysOf(const std::vector<const standin::Path*>& paths) {
  std::vector<std::string> keys;
  for (const standin::Path* path : paths) {
    keys.push_back(path == nullptr ? "(null)" : path->keys.empty() ? "(no key)" : path->keys.front().second);
  }
  return keys;
}

}  // namespace

std::vector<standin::Node> sampleNodes() {
  return {
      {40, "c0", "", "c0", "Computer System", {{nameId, "host"}}, {}},
      {49, "1a", "c0", "c0", "Network Device", {}, {}},
      {3, "f1", "1a", "c0", "Network Firmware", {{versionId, "7.1"}, {releaseDateId, "12/31/2010"}}, {}},
      {3, "f2", "c0", "c0", "BIOS", {{versionId, "2.0"}}, {{104, 2}, {107, 0}}},
      {2, "b1", "c0", "c0", "System BIOS", {{versionId, "2.1"}}, {}},
      {44, "d1", "c0", "c0", "first driver", {{driverVersionId, "5.10"}}, {}},
      {44, "d2", "c0", "c0", "second driver", {}, {}},
  };
}

ProviderTest::ProviderTest() : world(*providerAccess().world), broker{} {
  world.~World();
  new (&world) standin::World;
  world.nodes = sampleNodes();
  broker = world.newBroker();
  CMPIStatus status{CMPI_RC_ERROR, nullptr};
  instances = providerAccess().createInstanceMI(&broker, nullptr, &status);
  associations = providerAccess().createAssociationMI(&broker, nullptr, &status);
  EXPECT_EQ(status.rc, CMPI_RC_ERROR) << "the factories leave the status alone";
  EXPECT_TRUE(world.log.empty()) << "the factories log nothing";
}

ProviderTest::~ProviderTest() = default;

CMPIObjectPath* ProviderTest::path(const char* className) {
  return &world.newPath(className)->cmpi;
}

CMPIObjectPath* ProviderTest::pathOf(const std::string& instanceId) {
  standin::Path* made = world.newPath("KELVO_SoftwareIdentity");
  made->keys.emplace_back("InstanceID", instanceId);
  return &made->cmpi;
}

CMPIStatus ProviderTest::enumInstanceNames(const CMPIObjectPath* path) {
  return instances->ft->enumerateInstanceNames(instances, nullptr, world.result(), path);
}

CMPIStatus ProviderTest::enumInstances(const CMPIObjectPath* path, const char** properties) {
  return instances->ft->enumerateInstances(instances, nullptr, world.result(), path, properties);
}

CMPIStatus ProviderTest::getInstance(const CMPIObjectPath* path, const char** properties) {
  return instances->ft->getInstance(instances, nullptr, world.result(), path, properties);
}

std::vector<std::string> ProviderTest::returnedNames() const {
  return keysOf({world.returnedPaths.begin(), world.returnedPaths.end()});
}

std::vector<std::string> ProviderTest::returnedInstanceNames() const {
  std::vector<const standin::Path*> paths;
  for (const standin::Instance* instance : world.returnedInstances) {
    paths.push_back(instance != nullptr ? instance->path : nullptr);
  }
  return keysOf(paths);
}

std::string ProviderTest::property(std::size_t instance, const std::string& name) const {
  if (instance >= world.returnedInstances.size() || world.returnedInstances[instance] == nullptr) {
    return "(no instance)";
  }
  for (const auto& [key, value] : world.returnedInstances[instance]->properties) {
    if (key == name) {
      return value;
    }
  }
  return "(unset)";
}

std::vector<std::string> ProviderTest::texts(int level, bool trace) const {
  std::vector<std::string> found;
  for (const standin::LogLine& line : world.log) {
    if (line.level == level && line.trace == trace) {
      found.push_back(line.text);
    }
  }
  return found;
}

std::size_t ProviderTest::countCalls(const std::string& call) const {
  std::size_t count = 0;
  for (const std::string& made : world.calls) {
    count += made == call ? 1 : 0;
  }
  return count;
}
