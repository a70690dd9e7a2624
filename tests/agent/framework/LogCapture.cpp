#include "LogCapture.h"

#include <syslog.h>
#include <unistd.h>

#include <array>
#include <cstdarg>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <sstream>
#include <stdexcept>
#include <system_error>

namespace tests {

TemporaryFile::TemporaryFile()
    : path_((std::filesystem::temp_directory_path() / "swinv-log-XXXXXX").string()) {
  const int descriptor = ::mkstemp(path_.data());
  if (descriptor < 0) {
    throw std::runtime_error("Cannot make a temporary file " + path_);
  }
  ::close(descriptor);
}

TemporaryFile::~TemporaryFile() {
  std::error_code ignored;
  std::filesystem::remove(path_, ignored);
}

std::vector<std::string> TemporaryFile::lines() const {
  std::ifstream file(path_);
  std::ostringstream text;
  text << file.rdbuf();
  return linesOf(text.str());
}

std::vector<std::string> linesOf(const std::string& text) {
  std::vector<std::string> lines;
  std::istringstream stream(text);
  for (std::string line; std::getline(stream, line);) {
    lines.push_back(line);
  }
  return lines;
}

std::vector<std::string>& syslogMessages() {
  static std::vector<std::string> messages;
  return messages;
}

}  // namespace tests

// The linker takes this one before the C library's.
extern "C" void syslog(int priority, const char* format, ...) {
  std::array<char, 4096> text{};
  va_list arguments;
  va_start(arguments, format);
  // NOLINTNEXTLINE(clang-analyzer-valist.Uninitialized): va_start above makes it
  const int length = std::vsnprintf(text.data(), text.size(), format, arguments);
  va_end(arguments);
  if (length < 0) {
    throw std::runtime_error("A message to syslog cannot be formatted");
  }
  tests::syslogMessages().push_back(std::to_string(priority) + " " + text.data());
}
