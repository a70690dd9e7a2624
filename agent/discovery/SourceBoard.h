// The state that a source's thread shares with the one who waits for it. Whoever is last frees it.
#pragma once

#include <agent/discovery/Source.h>

#include <chrono>
#include <condition_variable>
#include <mutex>
#include <string>

namespace agent::discovery {

class SourceBoard {
 public:
  /// Says what the source does next.
  void doing(const std::string& what);

  /// Replaces the result; `last` ends the waiting.
  void publish(SourceResult result, bool last);

  struct Taken {
    SourceResult result;
    bool ended = false;
    std::string lastDone;  ///< where it did not end: what it was doing
  };

  /// Waits for the end of the source, at most until `deadline`, and takes what there is.
  Taken takeBy(std::chrono::steady_clock::time_point deadline);

 private:
  std::mutex mutex_;
  std::condition_variable changed_;
  SourceResult result_;
  std::string doing_;
  bool ended_ = false;
};

}  // namespace agent::discovery
