// Module files as kmod's tools write them, made from their text.
#pragma once

#include <string>
#include <string_view>

namespace agent::discovery::test {

/// A kernel module: an ELF file with a .modinfo section of these entries ("version=1.2", "license=GPL").
std::string moduleFile(std::string_view infoEntry);

/// An index file (modules.dep.bin, modules.builtin.bin) that holds one entry.
std::string indexFile(std::string_view key, std::string_view value);

}  // namespace agent::discovery::test
