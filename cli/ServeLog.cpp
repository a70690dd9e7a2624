#include <cli/Messages.h>
#include <cli/ServeLog.h>

#include <cstdlib>
#include <string>

#include <sys/stat.h>
#include <unistd.h>

namespace cli {
namespace {

/// The service manager names the stream that it made for standard error; what was redirected since is
/// another.
bool isStandardErrorTheJournal() {
  const char* stream = std::getenv("JOURNAL_STREAM");
  struct stat status {};
  return stream != nullptr && fstat(STDERR_FILENO, &status) == 0 &&
         std::to_string(status.st_dev) + ":" + std::to_string(status.st_ino) == stream;
}

/// In syslog's numbers, as sd-daemon(3) has them.
std::string_view priorityMark(cimom::http::LogLevel level) {
  switch (level) {
    case cimom::http::LogLevel::detail:
      return "<7>";
    case cimom::http::LogLevel::info:
      return "<6>";
    case cimom::http::LogLevel::warning:
      return "<4>";
    case cimom::http::LogLevel::error:
      return "<3>";
  }
  return "<3>";
}

}  // namespace

ServeLog::ServeLog(LogLevel level) : level_(level), isJournal_(isStandardErrorTheJournal()) {}

void ServeLog::write(cimom::http::LogLevel level, std::string_view line) const {
  const bool isWanted =
      level_ == LogLevel::Trace || (level_ == LogLevel::Error && level != cimom::http::LogLevel::detail);
  if (!isWanted) {
    return;
  }
  if (isJournal_) {
    complain(line, priorityMark(level));
  } else {
    complain(line);
  }
}

}  // namespace cli
