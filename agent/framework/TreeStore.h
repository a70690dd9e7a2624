// The one tree that all cursors of the process share.
//
// Threads: every operation may be called from any thread. The store lives until the process ends.
#pragma once

#include <agent/framework/NodeTree.h>
#include <agent/framework/TreeSource.h>
#include <agent/framework/TreeWatcher.h>

#include <chrono>
#include <condition_variable>
#include <functional>
#include <memory>
#include <mutex>
#include <string>

namespace agent {

class TreeStore {
 public:
  using Duration = std::chrono::steady_clock::duration;
  /// Tells the time; called from any thread, also while the store is locked.
  using Clock = std::function<std::chrono::steady_clock::time_point()>;

  /// How long a tree, or a failure to read one, stands before a request has the source read again.
  static constexpr Duration usualLifetime = std::chrono::seconds(60);

  /// The store of this process. It is never destroyed: a thread may still ask it while the process ends.
  static TreeStore& instance();

  /// The steady clock by the kernel's last tick, a few milliseconds late at most: every request asks it, and
  /// this costs a fraction of the exact time.
  static std::chrono::steady_clock::time_point lastTick();

  explicit TreeStore(Duration lifetime = usualLifetime, Clock clock = lastTick);
  /// Follows the source's events no more, and waits for the re-reading under way.
  ~TreeStore();
  TreeStore(const TreeStore&) = delete;
  TreeStore& operator=(const TreeStore&) = delete;

  /// The current tree. The first call reads it from the source that the environment names; calls that come
  /// meanwhile wait for it. From then on no call waits: one that finds the tree older than its lifetime has
  /// the source read again by a thread of the store's own, one at a time, and returns the tree that there is.
  /// The new tree replaces it as a whole, unless it is equal. Where it cannot be read the earlier tree stays,
  /// and a call after the same time tries again.
  ///
  /// Where the source has events (a live machine's, `eventsOf`), a thread of the store's own follows them
  /// from the first tree on, and has the source read again when it changed. Where they cannot be followed,
  /// that is logged, once, and the lifetime alone decides. A process that forks goes on without them in the
  /// child.
  ///
  /// Throws `Oru::InstrumentationException` with the reason where there is no tree because the source could
  /// not be read. The failure stands as long as a tree would: calls fail the same way without reading, and
  /// the first one after that reads again itself.
  ///
  /// Failures are logged once until a reading succeeds.
  std::shared_ptr<const NodeTree> current();

  /// Has the source read again in the background, as if its tree had come of age; a re-reading under way is
  /// followed by another one at the next call of `current`. A failure no longer stands: the next call reads.
  /// Without a tree yet there is nothing to do.
  void lookAnew();

  /// Waits for the re-reading that is under way, if one is.
  void waitForRereading();

  /// Replaces the tree as a whole. Cursors that stand on the earlier one keep it.
  void publish(NodeTree tree);

 private:
  using Tree = std::shared_ptr<const NodeTree>;
  /// What a reading came to: a tree, or the reason why there is none.
  struct Reading {
    Tree tree;
    std::string failure;
  };

  static Reading read(const TreeSource& source);
  void readFirst();
  void startRereading();
  void watch();
  void readAfterChange();
  void reread(const TreeSource& source, const Tree& old);
  void finishRereading(const Tree& old, Reading reading);
  bool noteFailure();

  const Duration lifetime_;
  const Clock clock_;
  std::mutex mutex_;  ///< guards what follows; held while the first tree is read
  Tree tree_;
  TreeSource source_;                             ///< what was read last, or is being read
  std::string failure_;                           ///< why there is no tree
  std::chrono::steady_clock::time_point readAt_;  ///< when `tree_` or `failure_` came
  bool isRereading_ = false;
  bool isOutdated_ = false;  ///< what was read, or is being read, no longer counts whatever its age
  bool isFailureLogged_ = false;
  bool isWatched_ = false;          ///< `watcher_` was started
  std::condition_variable reread_;  ///< the re-reading ended
  TreeWatcher watcher_;
};

}  // namespace agent
