#include <agent/discovery/SystemRoot.h>

#include <algorithm>
#include <array>
#include <cerrno>
#include <climits>
#include <memory>
#include <utility>

#include <dirent.h>
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

namespace agent::discovery {

namespace {

class File {
 public:
  explicit File(int descriptor) : descriptor_(descriptor) {}
  File(const File&) = delete;
  File& operator=(const File&) = delete;
  ~File() {
    if (descriptor_ >= 0) {
      ::close(descriptor_);
    }
  }
  [[nodiscard]] int get() const { return descriptor_; }

 private:
  int descriptor_;
};

struct CloseFolder {
  void operator()(DIR* folder) const { ::closedir(folder); }
};

/// The target of a link. EINVAL: not a link.
Outcome<std::string> readLink(const std::string& path) {
  std::array<char, PATH_MAX> buffer;  // readlink fills it
  const ssize_t length = ::readlink(path.c_str(), buffer.data(), buffer.size());
  if (length < 0) {
    return {std::nullopt, errno};
  }
  if (static_cast<std::size_t>(length) == buffer.size()) {
    return {std::nullopt, ENAMETOOLONG};
  }
  return {std::string(buffer.data(), static_cast<std::size_t>(length)), 0};
}

/// The path that is still to walk, name by name.
class Remaining {
 public:
  explicit Remaining(std::string_view path) : path_(path) {}

  /// The next name; empty at the end.
  std::string next() {
    const std::size_t begin = path_.find_first_not_of('/');
    if (begin == std::string::npos) {
      path_.clear();
      return {};
    }
    const std::size_t end = std::min(path_.find('/', begin), path_.size());
    std::string name = path_.substr(begin, end - begin);
    path_.erase(0, end);
    return name;
  }

  void putBefore(const std::string& target) { path_ = target + "/" + path_; }

 private:
  std::string path_;
};

}  // namespace

SystemRoot::SystemRoot(const std::filesystem::path& root) : root_(root.lexically_normal().string()) {
  while (!root_.empty() && root_.back() == '/') {
    root_.pop_back();
  }
  live_ = root.empty() || (root.is_absolute() && root_.empty());
}

std::string SystemRoot::outside(std::string_view path) const {
  std::string result = root_;
  result += '/';
  result += path;
  return result;
}

Outcome<std::string> SystemRoot::resolve(std::string_view path) const {
  std::string resolved;
  Remaining remaining(path);
  int links = 0;
  for (std::string name = remaining.next(); !name.empty(); name = remaining.next()) {
    if (name == ".") {
      continue;
    }
    if (name == "..") {
      resolved = parentFolder(resolved);
      continue;
    }
    std::string step = within(resolved, name);
    const Outcome<std::string> target = readLink(outside(step));
    if (!target && target.error != EINVAL) {
      return {std::nullopt, target.error};
    }
    if (!target) {
      resolved = std::move(step);
      continue;
    }
    if (++links > linkLimit) {
      return {std::nullopt, ELOOP};
    }
    if (target.value->front() == '/') {
      resolved.clear();
    }
    remaining.putBefore(*target.value);
  }
  return {std::move(resolved), 0};
}

Outcome<std::string> SystemRoot::locate(std::string_view path) const {
  // Below the system's own root the kernel follows links the same way, and faster.
  return live_ ? Outcome<std::string>{std::string(path), 0} : resolve(path);
}

Outcome<std::string> SystemRoot::read(std::string_view path, std::size_t limit) const {
  const Outcome<std::string> resolved = locate(path);
  if (!resolved) {
    return {std::nullopt, resolved.error};
  }
  // A pipe or a device in the place of a file must not hold up the caller: hence O_NONBLOCK.
  const File file(::open(outside(*resolved.value).c_str(), O_RDONLY | O_CLOEXEC | O_NONBLOCK));
  if (file.get() < 0) {
    return {std::nullopt, errno};
  }
  struct stat status {};
  if (::fstat(file.get(), &status) != 0) {
    return {std::nullopt, errno};
  }
  if (!S_ISREG(status.st_mode)) {
    return {std::nullopt, S_ISDIR(status.st_mode) ? EISDIR : EINVAL};
  }
  constexpr std::size_t block = std::size_t{64} * 1024;
  const std::size_t most = limit + 1;                // one more, to see what is longer
  std::string content(std::min(most, block), '\0');  // files are far smaller than their limits
  std::size_t length = 0;
  while (length < most) {
    if (length == content.size()) {
      content.resize(std::min(most, 2 * length));
    }
    const ssize_t count = ::read(file.get(), content.data() + length, content.size() - length);
    if (count < 0 && errno == EINTR) {
      continue;
    }
    if (count < 0) {
      return {std::nullopt, errno};
    }
    if (count == 0) {
      content.resize(length);
      return {std::move(content), 0};
    }
    length += static_cast<std::size_t>(count);
  }
  return {std::nullopt, EFBIG};
}

Outcome<std::vector<std::string>> SystemRoot::list(std::string_view path) const {
  const Outcome<std::string> resolved = locate(path);
  if (!resolved) {
    return {std::nullopt, resolved.error};
  }
  const std::unique_ptr<DIR, CloseFolder> folder(::opendir(outside(*resolved.value).c_str()));
  if (folder == nullptr) {
    return {std::nullopt, errno};
  }
  std::vector<std::string> names;
  for (;;) {
    errno = 0;
    const dirent* entry =
        ::readdir(folder.get());  // NOLINT(concurrency-mt-unsafe): the stream is this call's own
    if (entry == nullptr) {
      break;
    }
    std::string name = static_cast<const char*>(entry->d_name);
    if (name != "." && name != "..") {
      names.push_back(std::move(name));
    }
    if (names.size() > folderLimit) {
      return {std::nullopt, EFBIG};
    }
  }
  if (errno != 0) {
    return {std::nullopt, errno};
  }
  std::sort(names.begin(), names.end());
  return {std::move(names), 0};
}

Outcome<std::string> SystemRoot::linkTarget(std::string_view path) const {
  const Outcome<std::string> folder = locate(parentFolder(path));
  if (!folder) {
    return {std::nullopt, folder.error};
  }
  return readLink(outside(within(*folder.value, lastName(path))));
}

Outcome<std::string> SystemRoot::linkedName(std::string_view path) const {
  const Outcome<std::string> target = linkTarget(path);
  if (!target) {
    return {std::nullopt, target.error};
  }
  std::string_view text = *target.value;
  while (!text.empty() && text.back() == '/') {
    text.remove_suffix(1);
  }
  const std::string_view name = lastName(text);
  if (name.empty() || name == "." || name == "..") {
    return {std::nullopt, EINVAL};
  }
  return {std::string(name), 0};
}

std::string within(std::string_view folder, std::string_view name) {
  std::string path(folder);
  if (!path.empty()) {
    path += '/';
  }
  path += name;
  return path;
}

std::string_view lastName(std::string_view path) {
  const std::size_t slash = path.rfind('/');
  return slash == std::string_view::npos ? path : path.substr(slash + 1);
}

std::string_view parentFolder(std::string_view path) {
  const std::size_t slash = path.rfind('/');
  return slash == std::string_view::npos ? std::string_view() : path.substr(0, slash);
}

}  // namespace agent::discovery
