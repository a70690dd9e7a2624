// Where the tests of the logger look for what was logged.
#pragma once

#include <string>
#include <vector>

namespace tests {

/// A file of its own for one test, gone with the object.
class TemporaryFile {
 public:
  TemporaryFile();
  ~TemporaryFile();
  TemporaryFile(const TemporaryFile&) = delete;
  TemporaryFile& operator=(const TemporaryFile&) = delete;

  [[nodiscard]] const std::string& path() const { return path_; }
  [[nodiscard]] std::vector<std::string> lines() const;

 private:
  std::string path_;
};

std::vector<std::string> linesOf(const std::string& text);

/// Messages that went to syslog, each "PRIORITY text": this program has a syslog function of its own in the
/// place of the C library's.
std::vector<std::string>& syslogMessages();

}  // namespace tests
