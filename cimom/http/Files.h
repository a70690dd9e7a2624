// Small files that an administrator keeps for the server.
#pragma once

#include <sys/stat.h>

#include <optional>
#include <string>

namespace cimom::http {

struct File {
  std::string text;
  struct stat status {};
};

/// Reads a regular file of 4 MiB at most; nothing where there is none. Throws std::runtime_error: "PATH:
/// why".
[[nodiscard]] std::optional<File> readPublicFile(const std::string& path);

/// The same; a file that others than its owner and group may use, or its group may write, is an error too.
[[nodiscard]] std::optional<File> readSecretFile(const std::string& path);

}  // namespace cimom::http
