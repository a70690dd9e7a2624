#include "TestSource.h"

#include <agent/framework/TreeSource.h>

#include <ZelLog/ZelLogger.h>

#include <mutex>
#include <utility>

namespace {

std::mutex mutex;
std::function<agent::NodeTree()> currentSource;
std::function<std::unique_ptr<agent::Events>()> currentEvents;
bool isInventory = false;
std::vector<agent::testing::LoggedMessage> logged;

void log(bool isTrace, const std::string& category, int level, const char* file, const std::string& message) {
  const std::lock_guard lock(mutex);
  logged.push_back({isTrace, category, level, file, message});
}

}  // namespace

namespace agent {

TreeSource TreeSource::fromEnvironment() {
  const std::lock_guard lock(mutex);
  return isInventory ? TreeSource{"inventory.json", {}} : TreeSource{};
}

NodeTree readTree(const TreeSource&) {
  std::function<NodeTree()> source;
  {
    const std::lock_guard lock(mutex);
    source = currentSource;
  }
  return source ? source() : NodeTree();
}

std::unique_ptr<Events> eventsOf(const TreeSource& source) {
  std::function<std::unique_ptr<Events>()> events;
  {
    const std::lock_guard lock(mutex);
    events = currentEvents;
  }
  return events && source.isLive() ? events() : nullptr;
}

namespace testing {

void setSource(std::function<NodeTree()> source) {
  const std::lock_guard lock(mutex);
  currentSource = std::move(source);
}

void setEvents(std::function<std::unique_ptr<Events>()> events) {
  const std::lock_guard lock(mutex);
  currentEvents = std::move(events);
}

void setInventory(bool isOne) {
  const std::lock_guard lock(mutex);
  isInventory = isOne;
}

std::vector<LoggedMessage> takeLog() {
  const std::lock_guard lock(mutex);
  return std::exchange(logged, {});
}

}  // namespace testing
}  // namespace agent

namespace ZelLog {

void ZelLogger::logLevelMessage(const char*, const char* file, unsigned int, const std::string& category,
                                int level, const char*, int, int, const std::string& message) {
  log(false, category, level, file, message);
}

void ZelLogger::traceLevelMessage(const char*, const char* file, unsigned int, const std::string& category,
                                  int level, const char*, int, int, const std::string& message) {
  log(true, category, level, file, message);
}

}  // namespace ZelLog
