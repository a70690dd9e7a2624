// The provider as a file: what it exports, what it needs, and that it can be unmapped and loaded again.
#include <cmpi/cmpift.h>
#include <dlfcn.h>
#include <elf.h>
#include <gmock/gmock.h>

#include <cstring>
#include <fstream>
#include <iterator>
#include <string>
#include <vector>

namespace {

using testing::UnorderedElementsAre;

class ElfFile {
 public:
  explicit ElfFile(const std::string& path) {
    std::ifstream file(path, std::ios::binary);
    bytes_.assign(std::istreambuf_iterator<char>(file), {});
    header_ = at<Elf64_Ehdr>(0);
  }

  /// Names of the dynamic symbols that the file defines.
  std::vector<std::string> exportedSymbols() const {
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
  std::vector<std::string> neededLibraries() const {
    std::vector<std::string> names;
    const Elf64_Shdr table = section(SHT_DYNAMIC);
    const Elf64_Shdr strings = sectionAt(table.sh_link);
    for (std::size_t offset = 0; offset < table.sh_size; offset += sizeof(Elf64_Dyn)) {
      const auto entry = at<Elf64_Dyn>(table.sh_offset + offset);
      if (entry.d_tag == DT_NEEDED) {
        names.push_back(text(strings, entry.d_un.d_val));
      }
    }
    return names;
  }

 private:
  template <typename Record>
  Record at(std::size_t offset) const {
    Record record{};
    if (offset + sizeof(Record) > bytes_.size()) {
      throw std::runtime_error("the file ends too soon");
    }
    std::memcpy(&record, bytes_.data() + offset, sizeof(Record));
    return record;
  }
  Elf64_Shdr sectionAt(std::size_t index) const {
    return at<Elf64_Shdr>(header_.e_shoff + index * sizeof(Elf64_Shdr));
  }
  Elf64_Shdr section(unsigned int type) const {
    for (std::size_t i = 0; i < header_.e_shnum; ++i) {
      if (sectionAt(i).sh_type == type) {
        return sectionAt(i);
      }
    }
    throw std::runtime_error("no such section");
  }
  std::string text(const Elf64_Shdr& strings, std::size_t offset) const {
    return bytes_.substr(strings.sh_offset + offset,
                         bytes_.find('\0', strings.sh_offset + offset) - strings.sh_offset - offset);
  }

  std::string bytes_;
  Elf64_Ehdr header_{};
};

TEST(ProviderLibrary, ExportsTheTwoFactoriesAlone) {
  EXPECT_THAT(ElfFile(PROVIDER_LIBRARY).exportedSymbols(),
              UnorderedElementsAre("SoftwareInventoryProvider_Create_InstanceMI",
                                   "SoftwareInventoryProvider_Create_AssociationMI"));
}

TEST(ProviderLibrary, NeedsTheFrameworkAndTheStandardLibraryAlone) {
  std::vector<std::string> needed;
  for (const std::string& name : ElfFile(PROVIDER_LIBRARY).neededLibraries()) {
    // The runtimes of a sanitized build are not the library's own.
    if (!(SANITIZED && (name.rfind("libasan", 0) == 0 || name.rfind("libubsan", 0) == 0 ||
                        name.rfind("libtsan", 0) == 0 || name == "libm.so.6"))) {
      needed.push_back(name);
    }
  }
  EXPECT_THAT(needed, testing::IsSupersetOf({"liboru.so", "libstdc++.so.6", "libc.so.6"}));
  EXPECT_THAT(needed, testing::IsSubsetOf({"liboru.so", "libstdc++.so.6", "libgcc_s.so.1", "libc.so.6",
                                           "ld-linux-x86-64.so.2"}));
}

bool isMapped(const std::string& name) {
  std::ifstream maps("/proc/self/maps");
  for (std::string line; std::getline(maps, line);) {
    if (line.find(name) != std::string::npos) {
      return true;
    }
  }
  return false;
}

TEST(ProviderLibrary, IsUnmappedAndLoadedAgain) {
  for (int round = 0; round < 3; ++round) {
    void* library = dlopen(PROVIDER_LIBRARY, RTLD_NOW | RTLD_LOCAL);
    ASSERT_NE(library, nullptr) << dlerror();
    ASSERT_TRUE(isMapped("libSoftwareInventoryProvider.so"));
    using Factory = CMPIInstanceMI* (*)(const CMPIBroker*, const CMPIContext*, CMPIStatus*);
    const auto factory =
        reinterpret_cast<Factory>(dlsym(library, "SoftwareInventoryProvider_Create_InstanceMI"));
    ASSERT_NE(factory, nullptr);
    CMPIBroker broker{};
    CMPIInstanceMI* mi = factory(&broker, nullptr, nullptr);
    ASSERT_EQ(factory(&broker, nullptr, nullptr), mi);
    // A null path is of no class; the request runs through trace and framework all the same.
    EXPECT_EQ(mi->ft->enumerateInstanceNames(mi, nullptr, nullptr, nullptr).rc, CMPI_RC_ERR_INVALID_CLASS);
    EXPECT_EQ(mi->ft->cleanup(mi, nullptr, 1).rc, CMPI_RC_OK);
    ASSERT_EQ(dlclose(library), 0);
    EXPECT_FALSE(isMapped("libSoftwareInventoryProvider.so"));
    EXPECT_TRUE(isMapped("liboru.so")) << "the framework stays mapped";
  }
}

}  // namespace
