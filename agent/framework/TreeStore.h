// The one tree that all cursors of the process share.
//
// Threads: every operation may be called from any thread. The store lives until the process ends.
#pragma once

#include <agent/framework/NodeTree.h>

#include <memory>
#include <mutex>
#include <string>

namespace agent {

class TreeStore {
 public:
  /// The store of this process. It is never destroyed: a thread may still ask it while the process ends.
  static TreeStore& instance();

  TreeStore() = default;
  TreeStore(const TreeStore&) = delete;
  TreeStore& operator=(const TreeStore&) = delete;

  /// The current tree. The first call reads it from the source that the environment names; calls that come
  /// meanwhile wait for it. Throws `Oru::InstrumentationException` with the reason where the source could not
  /// be read: the failure is logged once and remembered, so that every later call fails the same way without
  /// reading again, until `publish` brings a tree.
  std::shared_ptr<const NodeTree> current();

  /// Replaces the tree as a whole. Cursors that stand on the earlier one keep it.
  void publish(NodeTree tree);

 private:
  std::mutex mutex_;  ///< guards both; held while the first tree is read
  std::shared_ptr<const NodeTree> tree_;
  std::string failure_;
};

}  // namespace agent
