// Files that appear whole or not at all.
#pragma once

#include <filesystem>
#include <string_view>

namespace cli {

/// Writes `text` to a new file beside `file`, brings it to the disk, and gives it the name `file` in one
/// step. An existing file is replaced with `replace` alone; what is there and is no regular file never is.
/// Throws `CommandError`; what was there before is then as it was.
void writeWhole(const std::filesystem::path& file, std::string_view text, bool replace);

}  // namespace cli
