// Has the machine looked at again when it changed.
#pragma once

#include <agent/framework/Events.h>

#include <condition_variable>
#include <functional>
#include <memory>
#include <mutex>
#include <string>

namespace agent {

/// A thread that waits for events. Threads: `stop` may be called from any thread, `start` from one at a time.
class TreeWatcher {
 public:
  /// What the thread calls; neither may throw, and what they use must live until `stop` returned.
  struct Calls {
    std::function<void()> look;                      ///< the machine changed; events wait until it returns
    std::function<void(const std::string&)> failed;  ///< nothing more will be followed, and why; once
  };

  TreeWatcher() = default;
  TreeWatcher(const TreeWatcher&) = delete;
  TreeWatcher& operator=(const TreeWatcher&) = delete;
  /// As `stop`.
  ~TreeWatcher();

  /// Starts the thread; once. All signals are blocked in it. It does not hold up the end of the process.
  /// Where no thread can be started, `failed` is called from here.
  void start(std::unique_ptr<Events> events, Calls calls);

  /// Ends the thread and waits for that, and for the look under way. Nothing happens where none was started.
  void stop();

 private:
  void run();

  Calls calls_;
  std::mutex mutex_;                ///< guards the coming and going of what follows
  std::unique_ptr<Events> events_;  ///< as long as the thread runs
  std::condition_variable ended_;
};

}  // namespace agent
