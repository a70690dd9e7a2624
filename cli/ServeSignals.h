// The signals that a server is told things with.
#pragma once

namespace cli {

enum class ServeSignal { Stop, Reload };

/// Signals wait from its construction on until they are asked for. Every thread that is started later
/// inherits that: make it before the first one.
class ServeSignals {
 public:
  ServeSignals();
  ServeSignals(const ServeSignals&) = delete;
  ServeSignals& operator=(const ServeSignals&) = delete;
  ~ServeSignals();

  /// Waits for SIGTERM or SIGINT (stop), or SIGHUP (reload).
  ServeSignal next();

  /// From now on SIGTERM and SIGINT end the process at once.
  void stopAtOnceFromNow();
};

}  // namespace cli
