#include <agent/framework/TreeSource.h>
#include <agent/framework/TreeStore.h>

#include <Oru/Exceptions.h>
#include <ZelLog/ZelLogger.h>

#include <exception>
#include <utility>

namespace agent {
namespace {

void logFailure(const std::string& message) {
  constexpr int errorLevel = 3000;
  const std::string category = "Oru.Framework";
  ZelLog::ZelLogger::logLevelMessage("TreeStore::current", "TreeStore.cpp", __LINE__, category, errorLevel,
                                     nullptr, 0, 0, message);
  ZelLog::ZelLogger::traceLevelMessage("TreeStore::current", "TreeStore.cpp", __LINE__, category, errorLevel,
                                       nullptr, 0, 0, message);
}

}  // namespace

TreeStore& TreeStore::instance() {
  static TreeStore* const store = std::make_unique<TreeStore>().release();
  return *store;
}

std::shared_ptr<const NodeTree> TreeStore::current() {
  const std::lock_guard lock(mutex_);
  if (!tree_ && failure_.empty()) {
    try {
      tree_ = std::make_shared<const NodeTree>(readTree(TreeSource::fromEnvironment()));
    } catch (const std::exception& error) {
      failure_ = std::string("the inventory cannot be read: ") + error.what();
      logFailure(failure_);
    }
  }
  if (!tree_) {
    throw Oru::InstrumentationException(failure_.c_str());
  }
  return tree_;
}

void TreeStore::publish(NodeTree tree) {
  std::shared_ptr<const NodeTree> fresh = std::make_shared<const NodeTree>(std::move(tree));
  const std::lock_guard lock(mutex_);
  tree_.swap(fresh);  // the earlier tree, where this is its last owner, goes after the lock
  failure_.clear();
}

}  // namespace agent
