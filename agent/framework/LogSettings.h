// What the environment says about logging: where the two channels go, and down to which level.
#pragma once

#include <cstdint>
#include <limits>
#include <string>
#include <vector>

namespace agent {

/// Where a channel's lines go.
struct LogTarget {
  enum class Kind { None, Syslog, StandardError, File };
  Kind kind = Kind::None;
  std::string path;  ///< of a file

  friend bool operator==(const LogTarget&, const LogTarget&) = default;
};

/// Levels of messages: the higher, the more detail.
inline constexpr int errorLevel = 3000;
inline constexpr int traceLevel = 4000;

/// A threshold that no level passes.
inline constexpr std::int64_t levelOff = std::numeric_limits<std::int64_t>::min();

struct LogSettings {
  LogTarget log{LogTarget::Kind::Syslog, {}};  ///< of the log channel
  LogTarget trace;                             ///< of the trace channel
  std::int64_t level = errorLevel;             ///< messages up to this level are written, on both channels
  std::vector<std::string> complaints;         ///< about values that were not understood, one line each

  /// Settings from the texts of ORU_LOG, ORU_TRACE and ORU_LOG_LEVEL; null and empty ones read as unset. A
  /// value that is not understood leaves the default, and a complaint.
  static LogSettings fromTexts(const char* log, const char* trace, const char* level);

  /// From the environment of the process. Where the process runs with rights that its caller has not
  /// (set-user-ID), the environment is not believed.
  static LogSettings fromEnvironment();
};

}  // namespace agent
