#include <ZelLog/ZelLogger.h>
#include <agent/framework/LogChannels.h>
#include <agent/framework/LogSettings.h>

#include <atomic>
#include <cstdint>
#include <limits>

namespace ZelLog {
namespace {

/// A threshold that has not been asked for yet.
constexpr std::int64_t unknown = std::numeric_limits<std::int64_t>::max();

std::atomic<std::int64_t> logThreshold{unknown};
std::atomic<std::int64_t> traceThreshold{unknown};

/// The channels of this process, by its environment at the first use. They are never destroyed: threads of
/// the process may log until its very end.
agent::LogChannels& channels() {
  static auto* const theChannels = new agent::LogChannels(agent::LogSettings::fromEnvironment());
  return *theChannels;
}

bool isOnAtFirstUse(ZelChannel channel, int level) noexcept try {
  logThreshold.store(channels().threshold(ZelChannel::Log), std::memory_order_relaxed);
  traceThreshold.store(channels().threshold(ZelChannel::Trace), std::memory_order_relaxed);
  return level <= channels().threshold(channel);
} catch (...) {
  return false;  // Out of memory; the next use tries again.
}

bool isOn(ZelChannel channel, int level) noexcept {
  const auto& known = channel == ZelChannel::Log ? logThreshold : traceThreshold;
  const std::int64_t threshold = known.load(std::memory_order_relaxed);
  if (threshold == unknown) [[unlikely]] {
    return isOnAtFirstUse(channel, level);
  }
  return level <= threshold;
}

void write(ZelChannel channel, const agent::LogEvent& event) noexcept {
  // A level that is on was read from the channels, so they exist.
  if (isOn(channel, event.level)) {
    channels().write(channel, event);
  }
}

}  // namespace

bool ZelLogger::isLevelOn(ZelChannel channel, int level) {
  return isOn(channel, level);
}

void ZelLogger::logLevelMessage(const char* function, const char* file, unsigned int line,
                                const std::string& category, int level, const char* /*reserved*/,
                                int /*reserved1*/, int /*reserved2*/, const std::string& message) {
  write(ZelChannel::Log, {function, file, line, category, level, message});
}

void ZelLogger::traceLevelMessage(const char* function, const char* file, unsigned int line,
                                  const std::string& category, int level, const char* /*reserved*/,
                                  int /*reserved1*/, int /*reserved2*/, const std::string& message) {
  write(ZelChannel::Trace, {function, file, line, category, level, message});
}

}  // namespace ZelLog
