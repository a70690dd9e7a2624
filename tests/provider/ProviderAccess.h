// How the tests of the provider's function tables reach the provider: linked into the test, or loaded as the
// shared library that object managers load, each over the recording stand-in.
#pragma once

#include <cmpi/cmpift.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <string>
#include <vector>

#include "standin/StandIn.h"

/// Defined twice: by LinkedProvider.cpp and by LoadedProvider.cpp.
struct ProviderAccess {
  CMPIInstanceMI* (*createInstanceMI)(const CMPIBroker*, const CMPIContext*, CMPIStatus*) = nullptr;
  CMPIAssociationMI* (*createAssociationMI)(const CMPIBroker*, const CMPIContext*, CMPIStatus*) = nullptr;
  standin::World* world = nullptr;
};
const ProviderAccess& providerAccess();

/// A fresh world, and the provider's interfaces over it.
class ProviderTest : public testing::Test {
 protected:
  ProviderTest();
  ~ProviderTest() override;

  /// A class path, with an InstanceID key where one is given.
  CMPIObjectPath* path(const char* className = "KELVO_SoftwareIdentity");
  CMPIObjectPath* pathOf(const std::string& instanceId);

  CMPIStatus enumInstanceNames(const CMPIObjectPath* path);
  CMPIStatus enumInstances(const CMPIObjectPath* path, const char** properties = nullptr);
  CMPIStatus getInstance(const CMPIObjectPath* path, const char** properties = nullptr);

  /// InstanceIDs of the paths, and of the instances' paths, that were delivered.
  std::vector<std::string> returnedNames() const;
  std::vector<std::string> returnedInstanceNames() const;
  /// A property of a delivered instance; "(unset)" where it has none.
  std::string property(std::size_t instance, const std::string& name) const;
  /// The texts logged at a level, to one channel.
  std::vector<std::string> texts(int level, bool trace = false) const;
  /// Forgets what happened and makes the first such call of the next request fail; `ask` is that request.
  template <typename Ask>
  void failFirst(const std::string& call, Ask ask) {
    world.forget();
    ask();
    const auto found = std::find(world.calls.begin(), world.calls.end(), call);
    ASSERT_NE(found, world.calls.end()) << call;
    const auto number = static_cast<std::size_t>(found - world.calls.begin()) + 1;
    world.forget();
    world.failAt = number;
  }
  std::size_t countCalls(const std::string& call) const;

  standin::World& world;
  CMPIBroker broker;
  CMPIInstanceMI* instances = nullptr;
  CMPIAssociationMI* associations = nullptr;
};

/// A computer (text c0) with two firmware nodes below a device 1a, one type-2 node, two drivers.
std::vector<standin::Node> sampleNodes();
