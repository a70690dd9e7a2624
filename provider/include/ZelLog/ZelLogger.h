// The agent's logger: two channels that take finished texts.
//
// Static operations, callable from any thread, that never throw. A logger copies what it keeps.
#pragma once

#include <string>

#pragma GCC visibility push(default)
namespace ZelLog {

/// Where an event goes. Callers that follow the tracing rules send every event to both.
enum class ZelChannel : int { Log, Trace };

class ZelLogger {
 public:
  ZelLogger() = delete;

  /// Writes one message to the log channel. `function`, `file` and `line` name the place that reports it,
  /// `category` the component, `level` its weight (3000 errors, 4000 routine; higher is more detail). The
  /// three arguments after the level are the logger's own and always null, 0, 0.
  static void logLevelMessage(const char* function, const char* file, unsigned int line,
                              const std::string& category, int level, const char* reserved, int reserved1,
                              int reserved2, const std::string& message);

  /// Writes one message to the trace channel; arguments as above.
  static void traceLevelMessage(const char* function, const char* file, unsigned int line,
                                const std::string& category, int level, const char* reserved, int reserved1,
                                int reserved2, const std::string& message);

  /// Is this level on for this channel? A weak symbol: a logger library may lack it, and then callers take
  /// every level as on. Test its address before the call.
  [[gnu::weak]] static bool isLevelOn(ZelChannel channel, int level);
};

}  // namespace ZelLog
#pragma GCC visibility pop
