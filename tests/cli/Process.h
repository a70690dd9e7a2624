// Runs the built swinv as a process.
#pragma once

#include <filesystem>
#include <map>
#include <string>
#include <vector>

namespace cli_test {

struct Result {
  int exitCode = -1;  ///< minus the signal where one ended the process
  std::string standardOutput;
  std::string standardError;
};

struct Start {
  std::vector<std::string> arguments;
  /// Variables besides PATH, TZ=UTC and LC_ALL=C.UTF-8, or instead of them.
  std::map<std::string, std::string> environment = {};
  std::filesystem::path program = SWINV_PROGRAM;
  int standardOutput = -1;           ///< a descriptor that takes the output; -1: it is captured
  bool closeStandardOutput = false;  ///< start without one
};

/// Starts, and does not wait. `output` and `error` are the descriptors of its standard output and error.
/// Throws `std::runtime_error` where the process cannot be started.
int spawn(const Start& start, int output, int error);

/// Waits for the end: as in `Result`.
int exitCodeOf(int process);

/// Runs to the end. Throws `std::runtime_error` where the process cannot be started.
Result run(const Start& start);

inline Result swinv(std::vector<std::string> arguments) {
  return run({std::move(arguments)});
}

/// Runs with a terminal of that width as standard output, which gives what the terminal got.
Result runOnTerminal(Start start, unsigned short width);

/// A file of this folder, or of another one of the source tree.
std::string testFile(const char* name);

/// A folder of the test's own, gone with it.
class TemporaryFolder {
 public:
  TemporaryFolder();
  ~TemporaryFolder();
  TemporaryFolder(const TemporaryFolder&) = delete;
  TemporaryFolder& operator=(const TemporaryFolder&) = delete;

  [[nodiscard]] std::filesystem::path at(const char* name) const { return path_ / name; }
  [[nodiscard]] std::size_t entries() const;

 private:
  std::filesystem::path path_;
};

std::string readFile(const std::filesystem::path& file);

std::vector<std::string> linesOf(const std::string& text);

}  // namespace cli_test
