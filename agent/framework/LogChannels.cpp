#include <agent/framework/LogChannels.h>

#include <fcntl.h>
#include <spdlog/details/log_msg.h>
#include <spdlog/pattern_formatter.h>
#include <spdlog/sinks/base_sink.h>
#include <syslog.h>
#include <unistd.h>

#include <cerrno>
#include <mutex>
#include <string>
#include <system_error>

namespace agent {
namespace {

using Kind = LogTarget::Kind;
using Buffer = spdlog::memory_buf_t;

constexpr std::string_view ownCategory = "Oru.ZelLogger";

void append(Buffer& line, std::string_view text) {
  line.append(text.data(), text.data() + text.size());
}

void appendEscape(Buffer& line, unsigned char byte) {
  constexpr std::string_view digits = "0123456789abcdef";
  const char escape[] = {'\\', 'x', digits[byte >> 4], digits[byte & 0xf]};
  append(line, {escape, sizeof escape});
}

/// Appends a text with its control characters escaped, those of UTF-8's second block (U+0080 to U+009F) too,
/// so that no text ends a line or steers a terminal.
void appendText(Buffer& line, std::string_view text) {
  for (std::size_t at = 0; at < text.size(); ++at) {
    const auto byte = static_cast<unsigned char>(text[at]);
    const auto next = at + 1 < text.size() ? static_cast<unsigned char>(text[at + 1]) : 0U;
    if (byte == '\n') {
      append(line, "\\n");
    } else if (byte == 0xc2 && next >= 0x80 && next < 0xa0) {
      appendEscape(line, static_cast<unsigned char>(next));
      ++at;
    } else if (byte < 0x20 || byte == 0x7f) {
      appendEscape(line, byte);
    } else {
      line.push_back(text[at]);
    }
  }
}

void appendText(Buffer& line, const char* text) {
  appendText(line, std::string_view(text ? text : "(null)"));
}

/// "error Category function (file:line): text"
void appendEvent(Buffer& line, const LogEvent& event) {
  if (event.level == errorLevel) {
    append(line, "error ");
  } else if (event.level == traceLevel) {
    append(line, "trace ");
  } else {
    append(line, std::to_string(event.level));
    append(line, " ");
  }
  appendText(line, event.category);
  append(line, " ");
  appendText(line, event.function);
  append(line, " (");
  appendText(line, event.file);
  append(line, ":");
  append(line, std::to_string(event.line));
  append(line, "): ");
  appendText(line, event.text);
}

spdlog::level::level_enum weightOf(int level) {
  return level <= errorLevel ? spdlog::level::err : spdlog::level::debug;
}

}  // namespace

// One destination. A line goes out in one write to a descriptor open for appending, so that processes that
// log to the same file keep each other's lines whole. Syslog is used as the process has opened it: its name
// and options are the process's business, not a library's.
class LogChannels::Sink final : public spdlog::sinks::base_sink<std::mutex> {
 public:
  explicit Sink(const LogTarget& target) : target_(target) {
    set_pattern("%Y-%m-%dT%H:%M:%S.%e%z %v");
    if (target_.kind == Kind::StandardError) {
      descriptor_ = STDERR_FILENO;
    } else if (target_.kind == Kind::File) {
      descriptor_ = ::open(target_.path.c_str(), O_WRONLY | O_APPEND | O_CREAT | O_CLOEXEC, 0640);
      if (descriptor_ < 0) {
        fallBack(errno);
      }
    }
  }
  ~Sink() override { closeFile(); }
  Sink(const Sink&) = delete;
  Sink& operator=(const Sink&) = delete;

  [[nodiscard]] const LogTarget& target() const { return target_; }

 private:
  void sink_it_(const spdlog::details::log_msg& message) override {
    if (kind_ == Kind::Syslog) {
      ::syslog(LOG_DAEMON | (message.level == spdlog::level::err ? LOG_ERR : LOG_DEBUG), "%.*s",
               static_cast<int>(message.payload.size()), message.payload.data());
      return;
    }
    Buffer line;
    formatter_->format(message, line);
    const int error = writeAll({line.data(), line.size()});
    if (error != 0) {
      fallBack(error);
      sink_it_(message);
    }
  }
  void flush_() override {}

  /// 0, or the error number. A line that a full pipe does not take is dropped rather than waited for.
  [[nodiscard]] int writeAll(std::string_view line) const {
    while (!line.empty()) {
      const ssize_t written = ::write(descriptor_, line.data(), line.size());
      if (written >= 0) {
        line.remove_prefix(static_cast<std::size_t>(written));
      } else if (errno == EAGAIN) {
        return 0;
      } else if (errno != EINTR) {
        return errno;
      }
    }
    return 0;
  }

  /// Goes on with the next destination that may work, and says so there.
  void fallBack(int error) {
    const bool fromFile = kind_ == Kind::File;
    closeFile();
    kind_ = fromFile ? Kind::StandardError : Kind::Syslog;
    descriptor_ = STDERR_FILENO;
    const std::string text = "Cannot write the log to " + (fromFile ? target_.path : "standard error") +
                             ": " + std::generic_category().message(error) + ". Going on with " +
                             (fromFile ? "standard error." : "syslog.");
    Buffer line;
    appendEvent(line, {__func__, "agent/framework/LogChannels.cpp", __LINE__, ownCategory, errorLevel, text});
    sink_it_({{}, spdlog::level::err, {line.data(), line.size()}});
  }

  void closeFile() {
    if (kind_ == Kind::File && descriptor_ >= 0) {
      ::close(descriptor_);
      descriptor_ = -1;
    }
  }

  const LogTarget target_;
  Kind kind_ = target_.kind;
  int descriptor_ = -1;
};

LogChannels::LogChannels(const LogSettings& settings) {
  if (settings.level == levelOff) {
    return;
  }
  const auto open = [&settings](const LogTarget& target) {
    return target.kind == Kind::None ? Channel{} : Channel{settings.level, std::make_shared<Sink>(target)};
  };
  log_ = open(settings.log);
  trace_ = settings.trace == settings.log ? log_ : open(settings.trace);
  for (const std::string& complaint : settings.complaints) {
    write(ZelLog::ZelChannel::Log,
          {__func__, "agent/framework/LogChannels.cpp", __LINE__, ownCategory, errorLevel, complaint});
  }
}

LogChannels::~LogChannels() = default;

const LogChannels::Channel& LogChannels::channel(ZelLog::ZelChannel which) const noexcept {
  return which == ZelLog::ZelChannel::Log ? log_ : trace_;
}

std::int64_t LogChannels::threshold(ZelLog::ZelChannel which) const noexcept {
  return channel(which).threshold;
}

void LogChannels::write(ZelLog::ZelChannel which, const LogEvent& event) noexcept try {
  const Channel& to = channel(which);
  if (event.level > to.threshold) {
    return;
  }
  Buffer line;
  appendEvent(line, event);
  to.sink->log({{}, weightOf(event.level), {line.data(), line.size()}});
} catch (...) {
  // Out of memory: a message is lost, the caller's work is not.
}

}  // namespace agent
