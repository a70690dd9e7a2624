#include <cli/FileWriter.h>
#include <cli/Messages.h>
#include <cli/Output.h>

#include <cerrno>
#include <cstdio>
#include <random>
#include <string>
#include <system_error>

#include <fcntl.h>
#include <unistd.h>

namespace cli {
namespace {

[[noreturn]] void fail(const std::filesystem::path& file, int error) {
  throw CommandError("cannot write " + file.string() + ": " + std::generic_category().message(error));
}

[[noreturn]] void refuse(const std::filesystem::path& file) {
  throw CommandError(file.string() + " exists and is left as it is; --force replaces it");
}

/// A file of its own that is gone again unless it is given its final name.
class TemporaryFile {
 public:
  explicit TemporaryFile(const std::filesystem::path& target)
      : target_(target), name_(target.string() + ".swinv-" + std::to_string(std::random_device()())) {
    descriptor_ = open(name_.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_CLOEXEC, 0666);
    if (descriptor_ < 0) {
      fail(target_, errno);
    }
  }
  ~TemporaryFile() {
    closeNow();
    if (!named_) {
      unlink(name_.c_str());
    }
  }
  TemporaryFile(const TemporaryFile&) = delete;
  TemporaryFile& operator=(const TemporaryFile&) = delete;

  void fill(std::string_view text) {
    Output output(descriptor_);
    output.write(text);
    output.flush();
    int error = output.error();
    if (error == 0 && fsync(descriptor_) != 0) {
      error = errno;
    }
    if (closeNow() != 0 && error == 0) {
      error = errno;
    }
    if (error != 0) {
      fail(target_, error);
    }
  }

  void takeName(bool replace) {
    if (replace) {
      named_ = std::rename(name_.c_str(), target_.c_str()) == 0;
    } else {
      named_ = renameat2(AT_FDCWD, name_.c_str(), AT_FDCWD, target_.c_str(), RENAME_NOREPLACE) == 0;
      // File systems that cannot refuse to replace can link, which never replaces.
      if (!named_ && errno == EINVAL && link(name_.c_str(), target_.c_str()) == 0) {
        unlink(name_.c_str());
        named_ = true;
      }
    }
    if (!named_) {
      const int error = errno;
      if (error == EEXIST) {
        refuse(target_);
      }
      fail(target_, error);
    }
  }

 private:
  int closeNow() {
    const int result = descriptor_ < 0 ? 0 : close(descriptor_);
    descriptor_ = -1;
    return result;
  }

  std::filesystem::path target_;
  std::string name_;
  int descriptor_ = -1;
  bool named_ = false;
};

}  // namespace

void writeWhole(const std::filesystem::path& file, std::string_view text, bool replace) {
  namespace fs = std::filesystem;
  std::error_code error;
  const fs::file_status status = fs::status(file, error);
  if (fs::exists(status) && !fs::is_regular_file(status)) {
    throw CommandError(file.string() +
                       " is no regular file; give the name of a file, or - for standard output");
  }
  if (fs::exists(status) && !replace) {
    refuse(file);
  }
  // A link that leads to a file stays one: the file behind it is replaced.
  const fs::path target = fs::exists(status) ? fs::canonical(file, error) : file;
  TemporaryFile temporary(error ? file : target);
  temporary.fill(text);
  temporary.takeName(replace);
}

}  // namespace cli
