// What the object manager says about providers' answers: lines for a log, and a count.
//
// Threads: several at once; the log's function is called from each of them.
#pragma once

#include <atomic>
#include <cstdint>
#include <functional>
#include <string>
#include <string_view>
#include <utility>

namespace cimom {

/// Takes one line of diagnostics; may be empty.
using Log = std::function<void(std::string_view)>;

class Diagnostics {
 public:
  explicit Diagnostics(Log log) : log_(std::move(log)) {}

  void report(const std::string& line) const {
    if (log_)
      log_(line);
  }

  /// For an answer that was OK without the done marker.
  void countUnfinished() const { unfinished_.fetch_add(1, std::memory_order_relaxed); }
  [[nodiscard]] std::uint64_t unfinished() const { return unfinished_.load(std::memory_order_relaxed); }

 private:
  Log log_;
  mutable std::atomic<std::uint64_t> unfinished_{0};
};

}  // namespace cimom
