#include <cli/Layout.h>
#include <cli/Messages.h>

#include <system_error>

namespace cli {

Layout ownLayout() {
  std::error_code error;
  const std::filesystem::path executable = std::filesystem::read_symlink("/proc/self/exe", error);
  if (error) {
    throw CommandError("cannot tell where swinv is installed: /proc/self/exe: " + error.message());
  }
  const std::filesystem::path root = executable.parent_path().parent_path();
  Layout layout{root / "lib", root / "share" / "swinv" / "schema", root / "libexec" / "swinv-endpoint"};
  if (!std::filesystem::is_directory(layout.schema, error)) {
    throw CommandError("the CIM schema is missing: there is no folder " + layout.schema.string() +
                       "\nIt belongs to swinv; install or build swinv again.");
  }
  return layout;
}

}  // namespace cli
