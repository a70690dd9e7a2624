#include "SmbiosBuilder.h"

#include <agent/framework/NodeTree.h>

#include <algorithm>
#include <numeric>
#include <sstream>
#include <stdexcept>

namespace agent::discovery::test {

namespace {

void append(std::string& bytes, std::uint64_t number, std::size_t width) {
  for (std::size_t i = 0; i < width; ++i) {
    bytes += static_cast<char>((number >> (8 * i)) & 0xffU);
  }
}

std::uint64_t numberOf(const std::string& text) {
  std::size_t used = 0;
  const std::uint64_t number = std::stoull(text, &used, 0);
  if (used != text.size()) {
    throw std::invalid_argument("no number: " + text);
  }
  return number;
}

/// "0x1fb" could be a byte as well as a number of three digits: the letter behind is always the width.
void appendField(std::string& bytes, const std::string& field) {
  static constexpr std::string_view widths = "b w   d   q";  // at 0, 2, 6 and 10
  const std::size_t place = field.empty() ? std::string::npos : widths.find(field.back());
  if (place == std::string::npos || field.back() == ' ') {
    throw std::invalid_argument("no field: " + field);
  }
  const std::size_t width = place == 0 ? 1 : place == 2 ? 2 : place == 6 ? 4 : 8;
  append(bytes, numberOf(field.substr(0, field.size() - 1)), width);
}

std::string structureBytes(const std::string& line) {
  const std::size_t at = line.find('@');
  const std::size_t colon = line.find(':');
  if (at == std::string::npos || colon == std::string::npos || at > colon) {
    throw std::invalid_argument("no structure: " + line);
  }
  std::istringstream rest(line.substr(colon + 1));
  std::string part;
  std::getline(rest, part, '|');
  std::string fields;
  std::istringstream words(part);
  for (std::string word; words >> word;) {
    appendField(fields, word);
  }
  std::string bytes;
  append(bytes, numberOf(cleanText(line.substr(0, at))), 1);
  append(bytes, fields.size() + smbios::Structure::headerLength, 1);
  append(bytes, numberOf(line.substr(at + 1, colon - at - 1)), 2);
  bytes += fields;
  const std::size_t before = bytes.size();
  while (std::getline(rest, part, '|')) {
    bytes += part.substr(1, part.ends_with(' ') ? part.size() - 2 : std::string::npos) + '\0';
  }
  bytes.append(bytes.size() == before ? 2 : 1, '\0');
  return bytes;
}

/// Sets the byte at `place` so that the `length` bytes from `begin` on add up to 0.
void setChecksum(std::string& bytes, std::size_t begin, std::size_t length, std::size_t place) {
  const auto first = bytes.begin() + static_cast<std::ptrdiff_t>(begin);
  const int sum = std::accumulate(first, first + static_cast<std::ptrdiff_t>(length), 0);
  bytes[place] = static_cast<char>(-sum & 0xff);
}

}  // namespace

std::string smbiosTable(std::string_view description) {
  std::string bytes;
  std::istringstream lines{std::string(description)};
  for (std::string line; std::getline(lines, line);) {
    line.erase(0, std::min(line.find_first_not_of(' '), line.size()));
    if (line.starts_with("end")) {
      line = "127 @0xfeff:";
    }
    if (!line.empty()) {
      bytes += structureBytes(line);
    }
  }
  return bytes;
}

std::string entryPoint32(unsigned int major, unsigned int minor, std::size_t tableLength,
                         std::size_t structures) {
  std::string bytes("_SM_\0\x1f", 6);
  append(bytes, major, 1);
  append(bytes, minor, 1);
  append(bytes, 0x100, 2);
  append(bytes, 0, 6);
  bytes += std::string("_DMI_\0", 6);
  append(bytes, tableLength, 2);
  append(bytes, 0x000e0000, 4);
  append(bytes, structures, 2);
  append(bytes, major * 16 + minor, 1);
  setChecksum(bytes, 0x10, 0x0f, 0x15);
  setChecksum(bytes, 0, 0x1f, 0x04);
  return bytes;
}

std::string entryPoint64(unsigned int major, unsigned int minor, std::size_t tableLength) {
  std::string bytes("_SM3_\0\x18", 7);
  append(bytes, major, 1);
  append(bytes, minor, 1);
  append(bytes, 0, 1);
  append(bytes, 1, 1);
  append(bytes, 0, 1);
  append(bytes, tableLength, 4);
  append(bytes, 0x7f000000, 8);
  setChecksum(bytes, 0, 0x18, 0x05);
  return bytes;
}

}  // namespace agent::discovery::test
