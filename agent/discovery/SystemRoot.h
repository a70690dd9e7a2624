// Bounded reading below a system root.
#pragma once

#include <cstddef>
#include <filesystem>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace agent::discovery {

/// A value, or the errno value of why there is none.
template <typename T>
struct Outcome {
  std::optional<T> value;
  int error = 0;

  explicit operator bool() const { return value.has_value(); }
};

/// The folder that holds sys/, proc/ and lib/. Paths are relative to it ("sys/class/net"). Symbolic links are
/// followed within it, as if it were "/": neither an absolute link nor ".." leads out. May be used from any
/// number of threads.
class SystemRoot {
 public:
  static constexpr std::size_t attributeLimit = 4096;
  static constexpr std::size_t folderLimit = 65536;
  static constexpr int linkLimit = 40;

  /// An empty path means "/".
  explicit SystemRoot(const std::filesystem::path& root);

  /// Whether this is the running system's own root.
  [[nodiscard]] bool isLive() const { return live_; }

  /// `path` as a path of the process, for messages and for libraries that open files themselves.
  [[nodiscard]] std::string outside(std::string_view path) const;

  /// `path` without links: the same file, named by folders alone. ELOOP after `linkLimit` links.
  [[nodiscard]] Outcome<std::string> resolve(std::string_view path) const;

  /// The content of a regular file. EFBIG where it is longer than `limit`, EINVAL where it is no regular
  /// file.
  [[nodiscard]] Outcome<std::string> read(std::string_view path, std::size_t limit = attributeLimit) const;

  /// The names in a folder, sorted. EFBIG where they are more than `folderLimit`.
  [[nodiscard]] Outcome<std::vector<std::string>> list(std::string_view path) const;

  /// The target of the link at `path`, as it stands there. EINVAL where `path` is no link.
  [[nodiscard]] Outcome<std::string> linkTarget(std::string_view path) const;

  /// The last name in the target of the link at `path`: sysfs names drivers, modules and buses that way.
  /// EINVAL where `path` is no link.
  [[nodiscard]] Outcome<std::string> linkedName(std::string_view path) const;

 private:
  /// A path that names the same file and holds no link that could lead out.
  [[nodiscard]] Outcome<std::string> locate(std::string_view path) const;

  std::string root_;  ///< without a slash at its end; empty for "/"
  bool live_ = false;
};

/// The path of `name` in `folder`.
std::string within(std::string_view folder, std::string_view name);

/// What follows the last slash.
std::string_view lastName(std::string_view path);

/// What stands before the last slash; empty where there is none.
std::string_view parentFolder(std::string_view path);

}  // namespace agent::discovery
