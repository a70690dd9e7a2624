// A machine with all that associations tie together, and how tests name its objects.
#pragma once

#include <Oru/Moniker.h>
#include <cmpi/cmpift.h>
#include <gtest/gtest.h>

#include <new>
#include <string>
#include <utility>
#include <vector>

#include "standin/StandIn.h"

namespace associations {

using Keys = std::vector<std::pair<std::string, std::string>>;
using References = std::vector<std::pair<std::string, CMPIObjectPath*>>;

/// Makes the world, by path texts: computer alpha (c0) with BIOS firmware f1, a management controller e0 with
/// its firmware f2, network device 1a with ports eth0 (5a) and eth1 (5b) and firmware f3 and f4, network
/// device 1b with port eth2 (5c) and firmware f5, and driver d1; computer beta (c1) with driver d2. Other
/// providers serve both computers, alpha's service processor, and the ports.
void setUpMachine(standin::World& world);

/// The node with that path text, to be altered.
standin::Node& nodeOf(standin::World& world, const std::string& text);

/// Another provider's answer: instances with one key each, narrowed by the keys that are asked about.
void serveInstances(standin::World& world, const char* className, const char* key,
                    const std::vector<std::string>& values);

// InstanceIDs of that machine's software, in the order of the walk.
inline const std::string bios = "192@f1";
inline const std::string bmc = "224@f2";
inline const std::string nicFirmware = "26@f3";
inline const std::string nicBootRom = "26@f4";
inline const std::string otherNicFirmware = "27@f5";
inline const std::string driver = "192@d1";
inline const std::string betaDriver = "193@d2";

// Paths as tests hand them over.
CMPIObjectPath* path(const char* className, const Keys& keys = {}, const References& references = {});
CMPIObjectPath* software(const std::string& instanceId);
CMPIObjectPath* computer(const std::string& name);
CMPIObjectPath* serviceProcessor(const std::string& name);
CMPIObjectPath* port(const std::string& deviceId);

// What describe() says of such paths.
std::string softwareText(const std::string& instanceId);
std::string computerText(const std::string& name);
std::string serviceProcessorText(const std::string& name);
std::string portText(const std::string& deviceId);
std::vector<std::string> allSoftwareTexts();

// What came back; "(null)" for null. An instance is named by its path.
std::string textOf(const CMPIObjectPath* path);
std::string textOf(const CMPIInstance* instance);
std::string propertyOf(const CMPIInstance* instance, const std::string& name);

// Monikers, and their keys as "Name=value,Name=value".
Oru::Moniker moniker(const Keys& keys);
std::string textOf(Oru::Moniker moniker);

/// What an action throws, which must be of that type.
template <typename Exception, typename Action>
std::string thrownBy(Action action) {
  try {
    action();
  } catch (const Exception& exception) {
    return exception.what();
  }
  return "(nothing was thrown)";
}

/// More steps than any walk of the machine takes: what comes so far has no end.
inline constexpr std::size_t tooMany = 40;

/// The usual loop over an adapter: test, use, advance.
template <typename Adapter, typename Use>
std::vector<std::string> walk(Adapter& adapter, Use use) {
  std::vector<std::string> found;
  while (adapter) {
    found.push_back(textOf(use(adapter)));
    if (found.size() == tooMany) {
      ADD_FAILURE() << "the walk has no end";
      break;
    }
    ++adapter;
  }
  return found;
}

/// A fresh machine, for the tests of one class beside the stand-in.
class MachineTest : public testing::Test {
 protected:
  MachineTest() : world(standin::world()) {
    world.~World();
    new (&world) standin::World;
    setUpMachine(world);
    broker = world.newBroker();
  }

  template <typename Action>
  std::vector<std::string> callsOf(Action action) {
    world.calls.clear();
    action();
    return world.calls;
  }

  standin::Node& node(const std::string& text) { return nodeOf(world, text); }
  /// What a class answers when its instances are asked for.
  standin::Served& served(const char* className) { return world.served.at(className); }

  standin::World& world;
  CMPIBroker broker{};
};

/// Calls by name; a call with arguments counts by what stands before the parenthesis, too.
std::size_t countOf(const std::vector<std::string>& calls, const std::string& call);

/// How often a function of a source file was entered, by the log channel.
std::size_t entriesOf(const standin::World& world, const std::string& function, const std::string& file);

/// The texts of a level, without their line numbers ("[Line: 12]" becomes "[Line: N]", "line 12" "line N").
std::vector<std::string> logTexts(const standin::World& world, int level, bool trace = false);

}  // namespace associations
