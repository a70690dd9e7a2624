#include <cli/Messages.h>
#include <cli/RunTool.h>

#include <algorithm>
#include <cerrno>
#include <csignal>
#include <cstdlib>
#include <filesystem>
#include <string_view>
#include <system_error>

#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

namespace cli {
namespace {

/// What the program starts with: the default action for signals that this process ignores.
class Attributes {
 public:
  Attributes() {
    posix_spawnattr_init(&attributes_);
    sigset_t defaults;
    sigemptyset(&defaults);
    sigaddset(&defaults, SIGPIPE);
    posix_spawnattr_setsigdefault(&attributes_, &defaults);
    posix_spawnattr_setflags(&attributes_, POSIX_SPAWN_SETSIGDEF);
  }
  ~Attributes() { posix_spawnattr_destroy(&attributes_); }
  Attributes(const Attributes&) = delete;
  Attributes& operator=(const Attributes&) = delete;
  [[nodiscard]] const posix_spawnattr_t* get() const { return &attributes_; }

 private:
  posix_spawnattr_t attributes_{};
};

std::string systemError(int error) {
  return std::generic_category().message(error);
}

bool isProgram(const std::string& file) {
  std::error_code error;
  return std::filesystem::is_regular_file(file, error) && access(file.c_str(), X_OK) == 0;
}

int waitFor(pid_t process, const std::string& program) {
  int status = 0;
  while (waitpid(process, &status, 0) == -1) {
    if (errno != EINTR) {
      throw CommandError("cannot wait for " + program + ": " + systemError(errno));
    }
  }
  if (WIFSIGNALED(status)) {
    throw CommandError(program + " was ended by signal " + std::to_string(WTERMSIG(status)));
  }
  return WEXITSTATUS(status);
}

}  // namespace

std::string findProgram(const std::string& name) {
  const char* path = std::getenv("PATH");
  std::string_view folders = path == nullptr ? std::string_view() : std::string_view(path);
  while (!folders.empty()) {
    const std::size_t end = std::min(folders.find(':'), folders.size());
    const std::string_view folder = folders.substr(0, end);
    std::string file = (folder.empty() ? std::string(".") : std::string(folder)) + "/" + name;
    if (isProgram(file)) {
      return file;
    }
    folders.remove_prefix(std::min(end + 1, folders.size()));
  }
  return {};
}

int runTool(const std::string& program, const std::vector<std::string>& arguments) {
  std::vector<std::string> texts{program};
  texts.insert(texts.end(), arguments.begin(), arguments.end());
  std::vector<char*> pointers;
  pointers.reserve(texts.size() + 1);
  for (std::string& text : texts) {
    pointers.push_back(text.data());
  }
  pointers.push_back(nullptr);
  const Attributes attributes;
  pid_t process = 0;
  if (const int error =
          posix_spawn(&process, program.c_str(), nullptr, attributes.get(), pointers.data(), environ)) {
    throw CommandError("cannot start " + program + ": " + systemError(error));
  }
  return waitFor(process, program);
}

}  // namespace cli
