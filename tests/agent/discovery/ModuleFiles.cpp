#include "ModuleFiles.h"

#include <elf.h>

#include <array>
#include <cstddef>
#include <cstdint>

namespace agent::discovery::test {

namespace {

template <typename T>
void append(std::string& bytes, const T& value) {
  bytes.append(reinterpret_cast<const char*>(&value), sizeof value);
}

void appendBigEndian(std::string& bytes, std::uint32_t number) {
  for (const unsigned int shift : {24U, 16U, 8U, 0U}) {
    bytes += static_cast<char>((number >> shift) & 0xffU);
  }
}

Elf64_Shdr section(std::uint32_t name, std::uint32_t type, std::size_t offset, std::size_t size) {
  Elf64_Shdr header{};
  header.sh_name = name;
  header.sh_type = type;
  header.sh_offset = offset;
  header.sh_size = size;
  header.sh_addralign = 1;
  return header;
}

}  // namespace

std::string moduleFile(std::string_view infoEntry) {
  using namespace std::string_literals;
  static const std::string names = "\0.modinfo\0.shstrtab\0"s;
  const std::string info = std::string(infoEntry) + '\0';

  Elf64_Ehdr header{};
  constexpr std::array<unsigned char, 7> identity = {ELFMAG0,    ELFMAG1,     ELFMAG2,   ELFMAG3,
                                                     ELFCLASS64, ELFDATA2LSB, EV_CURRENT};
  for (std::size_t i = 0; i < identity.size(); ++i) {
    header.e_ident[i] = identity[i];  // NOLINT(cppcoreguidelines-pro-bounds-constant-array-index)
  }
  header.e_type = ET_REL;
  header.e_machine = EM_X86_64;
  header.e_version = EV_CURRENT;
  header.e_ehsize = sizeof(Elf64_Ehdr);
  header.e_shentsize = sizeof(Elf64_Shdr);
  header.e_shnum = 3;
  header.e_shstrndx = 2;
  header.e_shoff = sizeof(Elf64_Ehdr);

  const std::size_t infoAt = sizeof(Elf64_Ehdr) + 3 * sizeof(Elf64_Shdr);
  std::string bytes;
  append(bytes, header);
  append(bytes, Elf64_Shdr{});
  append(bytes, section(1, SHT_PROGBITS, infoAt, info.size()));
  append(bytes, section(10, SHT_STRTAB, infoAt + info.size(), names.size()));
  return bytes + info + names;
}

std::string indexFile(std::string_view key, std::string_view value) {
  constexpr std::uint32_t magic = 0xB007F457;
  constexpr std::uint32_t version = 0x00020001;
  constexpr std::uint32_t rootAt = 12;
  constexpr std::uint32_t hasPrefix = 0x80000000;
  constexpr std::uint32_t hasValues = 0x40000000;
  std::string bytes;
  appendBigEndian(bytes, magic);
  appendBigEndian(bytes, version);
  appendBigEndian(bytes, rootAt | hasPrefix | hasValues);
  bytes.append(key).push_back('\0');
  appendBigEndian(bytes, 1);  // one value
  appendBigEndian(bytes, 0);  // its priority
  bytes.append(value).push_back('\0');
  return bytes;
}

}  // namespace agent::discovery::test
