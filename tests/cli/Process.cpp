#include "Process.h"

#include <array>
#include <csignal>
#include <cstdlib>
#include <fstream>
#include <sstream>
#include <stdexcept>
#include <thread>
#include <utility>

#include <fcntl.h>
#include <pty.h>
#include <spawn.h>
#include <sys/mman.h>
#include <sys/wait.h>
#include <unistd.h>

namespace cli_test {
namespace {

class Descriptor {
 public:
  explicit Descriptor(int number) : number_(number) {
    if (number < 0) {
      throw std::runtime_error("no file descriptor");
    }
  }
  ~Descriptor() { close(number_); }
  Descriptor(const Descriptor&) = delete;
  Descriptor& operator=(const Descriptor&) = delete;
  [[nodiscard]] int number() const { return number_; }

  [[nodiscard]] std::string contentFromStart() const {
    lseek(number_, 0, SEEK_SET);
    return rest();
  }
  /// Until the end, or (of a terminal) until the other side is gone.
  [[nodiscard]] std::string rest() const {
    std::string text;
    std::array<char, 4096> piece{};
    for (ssize_t got = 1; got > 0;) {
      got = read(number_, piece.data(), piece.size());
      text.append(piece.data(), static_cast<std::size_t>(got > 0 ? got : 0));
    }
    return text;
  }

 private:
  int number_;
};

std::vector<char*> pointers(std::vector<std::string>& texts) {
  std::vector<char*> result;
  for (std::string& text : texts) {
    result.push_back(text.data());
  }
  result.push_back(nullptr);
  return result;
}

/// The sanitizers' own variables go along: they say how a finding ends a process.
std::vector<std::string> environmentOf(const Start& start) {
  std::map<std::string, std::string> variables{
      {"PATH", "/usr/bin:/bin"}, {"TZ", "UTC"}, {"LC_ALL", "C.UTF-8"}};
  for (const char* name : {"ASAN_OPTIONS", "LSAN_OPTIONS", "UBSAN_OPTIONS", "TSAN_OPTIONS"}) {
    if (const char* value = std::getenv(name)) {
      variables[name] = value;
    }
  }
  for (const auto& [name, value] : start.environment) {
    variables[name] = value;
  }
  std::vector<std::string> texts;
  for (const auto& [name, value] : variables) {
    texts.push_back(name + "=" + value);
  }
  return texts;
}

}  // namespace

int spawn(const Start& start, int output, int error) {
  posix_spawn_file_actions_t actions;
  posix_spawn_file_actions_init(&actions);
  posix_spawn_file_actions_adddup2(&actions, output, STDOUT_FILENO);
  posix_spawn_file_actions_adddup2(&actions, error, STDERR_FILENO);
  if (start.closeStandardOutput) {
    posix_spawn_file_actions_addclose(&actions, STDOUT_FILENO);
  }
  std::vector<std::string> arguments{start.program.string()};
  arguments.insert(arguments.end(), start.arguments.begin(), start.arguments.end());
  std::vector<std::string> environment = environmentOf(start);
  pid_t process = 0;
  const int failure = posix_spawn(&process, start.program.c_str(), &actions, nullptr,
                                  pointers(arguments).data(), pointers(environment).data());
  posix_spawn_file_actions_destroy(&actions);
  if (failure != 0) {
    throw std::runtime_error("cannot start " + start.program.string());
  }
  return process;
}

int exitCodeOf(int process) {
  int status = 0;
  waitpid(process, &status, 0);
  return WIFEXITED(status) ? WEXITSTATUS(status) : -WTERMSIG(status);
}

Result run(const Start& start) {
  const Descriptor output(memfd_create("stdout", MFD_CLOEXEC));
  const Descriptor error(memfd_create("stderr", MFD_CLOEXEC));
  const int target = start.standardOutput < 0 ? output.number() : start.standardOutput;
  const pid_t process = spawn(start, target, error.number());
  Result result;
  result.exitCode = exitCodeOf(process);
  result.standardOutput = output.contentFromStart();
  result.standardError = error.contentFromStart();
  return result;
}

Result runOnTerminal(Start start, unsigned short width) {
  int master = -1;
  int slave = -1;
  winsize size{};
  size.ws_col = width;
  size.ws_row = 24;
  if (openpty(&master, &slave, nullptr, nullptr, &size) != 0) {
    throw std::runtime_error("no pseudo terminal");
  }
  fcntl(master, F_SETFD, FD_CLOEXEC);
  fcntl(slave, F_SETFD, FD_CLOEXEC);
  const Descriptor reader(master);
  const Descriptor error(memfd_create("stderr", MFD_CLOEXEC));
  Result result;
  pid_t process = 0;
  {
    const Descriptor writer(slave);
    process = spawn(start, writer.number(), error.number());
  }
  result.standardOutput = reader.rest();
  result.exitCode = exitCodeOf(process);
  result.standardError = error.contentFromStart();
  return result;
}

std::string testFile(const char* name) {
  return (std::filesystem::path(SWINV_SOURCE_FOLDER) / name).string();
}

TemporaryFolder::TemporaryFolder() {
  std::string name = (std::filesystem::temp_directory_path() / "swinv-test-XXXXXX").string();
  if (mkdtemp(name.data()) == nullptr) {
    throw std::runtime_error("cannot make " + name);
  }
  path_ = name;
}

TemporaryFolder::~TemporaryFolder() {
  std::error_code ignored;
  std::filesystem::remove_all(path_, ignored);
}

std::size_t TemporaryFolder::entries() const {
  return static_cast<std::size_t>(
      std::distance(std::filesystem::directory_iterator(path_), std::filesystem::directory_iterator()));
}

std::string readFile(const std::filesystem::path& file) {
  std::stringstream text;
  text << std::ifstream(file).rdbuf();
  return text.str();
}

std::vector<std::string> linesOf(const std::string& text) {
  std::vector<std::string> lines;
  std::istringstream stream(text);
  for (std::string line; std::getline(stream, line);) {
    lines.push_back(line);
  }
  return lines;
}

}  // namespace cli_test
