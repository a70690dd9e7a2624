#include <agent/framework/LogSettings.h>

#include <charconv>
#include <cstdlib>
#include <optional>
#include <string_view>
#include <system_error>

namespace agent {
namespace {

bool isSet(const char* text) {
  return text != nullptr && *text != '\0';
}

std::optional<LogTarget> readTarget(std::string_view text) {
  constexpr std::string_view filePrefix = "file:";
  if (text == "syslog") {
    return LogTarget{LogTarget::Kind::Syslog, {}};
  }
  if (text == "stderr") {
    return LogTarget{LogTarget::Kind::StandardError, {}};
  }
  if (text.starts_with(filePrefix) && text.size() > filePrefix.size()) {
    return LogTarget{LogTarget::Kind::File, std::string(text.substr(filePrefix.size()))};
  }
  return std::nullopt;
}

std::optional<std::int64_t> readLevel(std::string_view text) {
  if (text == "off") {
    return levelOff;
  }
  if (text == "error") {
    return errorLevel;
  }
  if (text == "trace") {
    return traceLevel;
  }
  unsigned int number = 0;
  const char* end = text.data() + text.size();
  const auto [stop, error] = std::from_chars(text.data(), end, number);
  if (error != std::errc() || stop != end) {
    return std::nullopt;
  }
  return number;
}

}  // namespace

LogSettings LogSettings::fromTexts(const char* log, const char* trace, const char* level) {
  LogSettings settings;
  if (isSet(log)) {
    if (auto target = readTarget(log)) {
      settings.log = *std::move(target);
    } else {
      settings.complaints.push_back("ORU_LOG is \"" + std::string(log) +
                                    "\"; it takes syslog, stderr or file:PATH. Using syslog.");
    }
  }
  if (isSet(trace) && std::string_view(trace) != "none") {
    if (auto target = readTarget(trace)) {
      settings.trace = *std::move(target);
    } else {
      settings.complaints.push_back("ORU_TRACE is \"" + std::string(trace) +
                                    "\"; it takes none, syslog, stderr or file:PATH. Using none.");
    }
  }
  if (isSet(level)) {
    if (const auto threshold = readLevel(level)) {
      settings.level = *threshold;
    } else {
      settings.complaints.push_back("ORU_LOG_LEVEL is \"" + std::string(level) +
                                    "\"; it takes off, error, trace or a number. Using error.");
    }
  }
  return settings;
}

LogSettings LogSettings::fromEnvironment() {
  return fromTexts(::secure_getenv("ORU_LOG"), ::secure_getenv("ORU_TRACE"),
                   ::secure_getenv("ORU_LOG_LEVEL"));
}

}  // namespace agent
