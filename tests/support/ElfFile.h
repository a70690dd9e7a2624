// What a shared library says of itself: the names that it exports, the libraries that it needs, its flags.
//
// Reads the file itself, so that a test needs no program of the machine. Throws `std::runtime_error` where
// the file is no 64-bit ELF file of this machine's byte order.
#pragma once

#include <elf.h>

#include <cstring>
#include <fstream>
#include <iterator>
#include <stdexcept>
#include <string>
#include <vector>

namespace tests {

class ElfFile {
 public:
  explicit ElfFile(const std::string& path) {
    std::ifstream file(path, std::ios::binary);
    bytes_.assign(std::istreambuf_iterator<char>(file), {});
    header_ = at<Elf64_Ehdr>(0);
  }

  /// Names of the dynamic symbols that the file defines.
  [[nodiscard]] std::vector<std::string> exportedSymbols() const {
    std::vector<std::string> names;
    const Elf64_Shdr table = section(SHT_DYNSYM);
    const Elf64_Shdr strings = sectionAt(table.sh_link);
    for (std::size_t offset = 0; offset < table.sh_size; offset += sizeof(Elf64_Sym)) {
      const auto symbol = at<Elf64_Sym>(table.sh_offset + offset);
      if (symbol.st_shndx != SHN_UNDEF && symbol.st_name != 0) {
        names.push_back(text(strings, symbol.st_name));
      }
    }
    return names;
  }

  /// DT_NEEDED entries.
  [[nodiscard]] std::vector<std::string> neededLibraries() const { return dynamicTexts(DT_NEEDED); }

  /// Where the loader looks for them first: DT_RUNPATH, and DT_RPATH, as they stand there.
  [[nodiscard]] std::vector<std::string> runPaths() const {
    std::vector<std::string> paths = dynamicTexts(DT_RUNPATH);
    for (const std::string& path : dynamicTexts(DT_RPATH)) {
      paths.push_back(path);
    }
    return paths;
  }

  /// DT_FLAGS_1 (DF_1_NODELETE and the like); 0 where there are none.
  [[nodiscard]] std::uint64_t flags() const {
    for (const Elf64_Dyn& entry : dynamicEntries()) {
      if (entry.d_tag == DT_FLAGS_1) {
        return entry.d_un.d_val;
      }
    }
    return 0;
  }

 private:
  template <typename Record>
  [[nodiscard]] Record at(std::size_t offset) const {
    Record record{};
    if (offset > bytes_.size() || bytes_.size() - offset < sizeof(Record)) {
      throw std::runtime_error("the file ends too soon");
    }
    std::memcpy(&record, bytes_.data() + offset, sizeof(Record));
    return record;
  }

  [[nodiscard]] Elf64_Shdr sectionAt(std::size_t index) const {
    return at<Elf64_Shdr>(header_.e_shoff + index * sizeof(Elf64_Shdr));
  }

  [[nodiscard]] Elf64_Shdr section(unsigned int type) const {
    for (std::size_t i = 0; i < header_.e_shnum; ++i) {
      if (sectionAt(i).sh_type == type) {
        return sectionAt(i);
      }
    }
    throw std::runtime_error("no such section");
  }

  [[nodiscard]] std::vector<std::string> dynamicTexts(Elf64_Sxword tag) const {
    std::vector<std::string> texts;
    const Elf64_Shdr strings = sectionAt(section(SHT_DYNAMIC).sh_link);
    for (const Elf64_Dyn& entry : dynamicEntries()) {
      if (entry.d_tag == tag) {
        texts.push_back(text(strings, entry.d_un.d_val));
      }
    }
    return texts;
  }

  [[nodiscard]] std::vector<Elf64_Dyn> dynamicEntries() const {
    std::vector<Elf64_Dyn> entries;
    const Elf64_Shdr table = section(SHT_DYNAMIC);
    for (std::size_t offset = 0; offset < table.sh_size; offset += sizeof(Elf64_Dyn)) {
      entries.push_back(at<Elf64_Dyn>(table.sh_offset + offset));
    }
    return entries;
  }

  [[nodiscard]] std::string text(const Elf64_Shdr& strings, std::size_t offset) const {
    const std::size_t begin = strings.sh_offset + offset;
    const std::size_t end = bytes_.find('\0', begin);
    if (begin > bytes_.size() || end == std::string::npos) {
      throw std::runtime_error("a text lies beyond the file");
    }
    return bytes_.substr(begin, end - begin);
  }

  std::string bytes_;
  Elf64_Ehdr header_{};
};

}  // namespace tests
