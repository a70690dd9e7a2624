// Stands in for the source of the tree and for the logger, so that the cursor can be tested without a
// machine.
#pragma once

#include <agent/framework/NodeTree.h>

#include <functional>
#include <string>
#include <vector>

namespace agent::testing {

/// What `agent::readTree` does from now on; an empty tree at first. It may be called from any thread.
void setSource(std::function<NodeTree()> source);

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
