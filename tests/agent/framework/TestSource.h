// Stands in for the source of the tree and for the logger, so that the cursor can be tested without a
// machine.
#pragma once

#include <agent/framework/Events.h>
#include <agent/framework/NodeTree.h>

#include <functional>
#include <memory>
#include <string>
#include <vector>

namespace agent::testing {

/// What `agent::readTree` does from now on; an empty tree at first. It may be called from any thread.
void setSource(std::function<NodeTree()> source);

/// What `agent::eventsOf` gives from now on; at first the source has none.
void setEvents(std::function<std::unique_ptr<Events>()> events);

/// Whether the source is an inventory file from now on; at first it is a live machine.
void setInventory(bool isInventory);

struct LoggedMessage {
  bool isTrace = false;
  std::string category;
  int level = 0;
  std::string file;
  std::string message;
};

/// What was logged since the last call.
std::vector<LoggedMessage> takeLog();

}  // namespace agent::testing
