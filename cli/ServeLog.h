// The log of the server: standard error, a line each.
#pragma once

#include <cimom/http/Settings.h>
#include <cli/Options.h>

#include <string_view>

namespace cli {

/// What is worth a line at a level of --log-level. From any thread.
class ServeLog {
 public:
  /// Where standard error is the journal's, each line carries its priority.
  explicit ServeLog(LogLevel level);

  void write(cimom::http::LogLevel level, std::string_view line) const;

 private:
  LogLevel level_;
  bool isJournal_;
};

}  // namespace cli
