// The two channels of the logger, over spdlog.
//
// Threads: everything may be called from any thread; a line is written whole. Nothing throws after
// construction.
#pragma once

#include <ZelLog/ZelLogger.h>
#include <agent/framework/LogSettings.h>

#include <cstdint>
#include <memory>
#include <string_view>

namespace agent {

/// One message, as a caller of the logger hands it over. Nothing of it is kept.
struct LogEvent {
  const char* function = nullptr;
  const char* file = nullptr;
  unsigned int line = 0;
  std::string_view category;
  int level = 0;
  std::string_view text;
};

class LogChannels {
 public:
  /// Opens what the settings name, and logs their complaints as errors. A file that cannot be opened, or
  /// later not written, is replaced by standard error, and that by syslog, with one message about it.
  explicit LogChannels(const LogSettings& settings);
  ~LogChannels();
  LogChannels(const LogChannels&) = delete;
  LogChannels& operator=(const LogChannels&) = delete;

  /// The highest level that the channel writes; `levelOff` where it writes none.
  [[nodiscard]] std::int64_t threshold(ZelLog::ZelChannel channel) const noexcept;

  /// Writes the event if its level is on.
  void write(ZelLog::ZelChannel channel, const LogEvent& event) noexcept;

 private:
  class Sink;
  struct Channel {
    std::int64_t threshold = levelOff;
    std::shared_ptr<Sink> sink;  ///< both channels share it where they go to the same place
  };
  [[nodiscard]] const Channel& channel(ZelLog::ZelChannel which) const noexcept;

  Channel log_;
  Channel trace_;
};

}  // namespace agent
