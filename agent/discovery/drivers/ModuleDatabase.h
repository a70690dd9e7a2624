// What the module files of a kernel release tell about a module.
#pragma once

#include <filesystem>
#include <memory>
#include <optional>
#include <string>

namespace agent::discovery {

/// Called from the thread of the driver source alone.
class ModuleDatabase {
 public:
  struct Answer {
    int error = 0;                       ///< an errno value; ENOENT: the database does not know the module
    std::optional<std::string> version;  ///< as the module's author wrote it; nothing where there is none
  };

  ModuleDatabase() = default;
  ModuleDatabase(const ModuleDatabase&) = delete;
  ModuleDatabase& operator=(const ModuleDatabase&) = delete;
  virtual ~ModuleDatabase() = default;

  /// The version of the module with that name, loadable or built in.
  virtual Answer version(const std::string& module) = 0;
};

/// The database in `folder` (lib/modules/RELEASE), read through libkmod. Reads nothing outside the folder: no
/// modprobe configuration. Null where libkmod refuses.
std::shared_ptr<ModuleDatabase> makeModuleDatabase(const std::filesystem::path& folder);

}  // namespace agent::discovery
