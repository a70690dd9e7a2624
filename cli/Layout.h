// Where the program's own files are: relative to the executable, built or installed.
#pragma once

#include <filesystem>

namespace cli {

struct Layout {
  std::filesystem::path libraries;  ///< ../lib
  std::filesystem::path schema;     ///< ../share/swinv/schema
  std::filesystem::path endpoint;   ///< ../libexec/swinv-endpoint
};

/// Throws `CommandError` where the schema is not there; providers are looked for when they are loaded.
Layout ownLayout();

}  // namespace cli
