#include <Oru/Exceptions.h>

#include <stdexcept>

#include "StandIn.h"

namespace standin {

namespace {

CMPIStatus status(CMPIrc code) {
  return {code, nullptr};
}

CMPIStatus returnInstance(const CMPIResult*, const CMPIInstance* instance) {
  const bool fails = world().record("returnInstance", false);
  world().returnedInstances.push_back(instance != nullptr ? static_cast<Instance*>(instance->hdl) : nullptr);
  return status(fails ? CMPI_RC_ERR_FAILED : CMPI_RC_OK);
}

CMPIStatus returnObjectPath(const CMPIResult*, const CMPIObjectPath* path) {
  const bool fails = world().record("returnObjectPath", false);
  world().returnedPaths.push_back(path != nullptr ? static_cast<Path*>(path->hdl) : nullptr);
  return status(fails ? CMPI_RC_ERR_FAILED : CMPI_RC_OK);
}

CMPIStatus returnDone(const CMPIResult*) {
  const bool fails = world().record("returnDone", false);
  ++world().done;
  return status(fails ? CMPI_RC_ERR_FAILED : CMPI_RC_OK);
}

const char* charPtr(const CMPIString* string, CMPIStatus*) {
  return static_cast<const char*>(string->hdl);
}

CMPIStringFT makeStringTable() {
  CMPIStringFT table{};
  table.ftVersion = CMPICurrentVersion;
  table.getCharPtr = charPtr;
  return table;
}

CMPIStringFT stringTable = makeStringTable();

CMPIString* getClassName(const CMPIObjectPath* path, CMPIStatus* answer) {
  static thread_local CMPIString string;
  const bool fails = world().record("getClassName", false);
  if (answer != nullptr) {
    *answer = status(fails ? CMPI_RC_ERR_FAILED : world().classNameStatus);
  }
  if (fails) {
    return nullptr;
  }
  string.hdl = static_cast<Path*>(path->hdl)->className.data();
  string.ft = &stringTable;
  return &string;
}

// Asked for where a trace prints a path, and therefore no recorded call.
CMPIString* toString(const CMPIObjectPath* path, CMPIStatus* answer) {
  static thread_local std::string text;
  static thread_local CMPIString string;
  if (answer != nullptr) {
    *answer = status(CMPI_RC_OK);
  }
  text = describe(static_cast<Path*>(path->hdl));
  string.hdl = text.data();
  string.ft = &stringTable;
  return &string;
}

CMPIResultFT makeResultTable() {
  CMPIResultFT table{};
  table.ftVersion = CMPICurrentVersion;
  table.returnInstance = returnInstance;
  table.returnObjectPath = returnObjectPath;
  table.returnDone = returnDone;
  return table;
}

CMPIObjectPathFT makePathTable() {
  CMPIObjectPathFT table{};
  table.ftVersion = CMPICurrentVersion;
  table.getClassName = getClassName;
  table.toString = toString;
  return table;
}

[[noreturn]] void throwFault(Fault fault) {
  switch (fault) {
    case Fault::ThrowOther:
      throw std::runtime_error("another failure");
    case Fault::ThrowNumber:
      throw int{1};  // NOLINT(hicpp-exception-baseclass): what the provider cannot know
    default:
      throw Oru::InstrumentationException("injected failure");
  }
}

CMPIResultFT resultTable = makeResultTable();
CMPIObjectPathFT pathTable = makePathTable();

}  // namespace

World::World() {
  classIds = {{"KELVO_SoftwareIdentity", 2},
              {"Second_SoftwareIdentity", 10},
              {"Refused_Class", 11},
              {"KELVO_InstalledSoftwareIdentity", 3},
              {"KELVO_NetworkSoftwareIdentity", 35},
              {"KELVO_BMCSoftwareIdentity", 117},
              {"KELVO_BIOSSoftwareIdentity", 118},
              {"KELVO_ComputerSystem", 1},
              {"KELVO_NetworkPort", 17},
              {"KELVO_SPComputerSystem", 119}};
  result_.hdl = this;
  result_.ft = &resultTable;
}

World::~World() = default;

bool World::record(std::string call, bool mayThrow, bool hasBadResult) {
  calls.push_back(std::move(call));
  if (failAt == 0 || calls.size() != failAt) {
    return false;
  }
  faultReached = true;
  faultCall = calls.back();
  if (fault == Fault::Result) {
    faultApplied = hasBadResult;
    return hasBadResult;
  }
  faultApplied = mayThrow;
  if (mayThrow) {
    throwFault(fault);
  }
  return false;
}

void World::forget() {
  calls.clear();
  log.clear();
  returnedPaths.clear();
  returnedInstances.clear();
  brokersUsed.clear();
  upcalls.clear();
  written.clear();
  done = 0;
  failAt = 0;
  faultReached = false;
  faultApplied = false;
  faultCall.clear();
}

Path* World::newPath(std::string className, std::string nameSpace) {
  auto& path = paths_.emplace_back(std::make_unique<Path>());
  path->className = std::move(className);
  path->nameSpace = std::move(nameSpace);
  path->cmpi = {path.get(), &pathTable};
  return path.get();
}

CMPIResult* World::result() {
  return &result_;
}

const Node* World::find(const std::string& text) const {
  for (const Node& node : nodes) {
    if (node.text == text) {
      return &node;
    }
  }
  return nullptr;
}

World& world() {
  static World theWorld;
  return theWorld;
}

}  // namespace standin
