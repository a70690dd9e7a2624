#include <cstdint>
#include <sstream>
#include <string>

#include "Fuzzer.h"
#include "Linux/InstanceId.h"

namespace inventory = Oru::SoftwareInventoryProfileProvider;

// An InstanceID means what formatted stream extraction makes of it.
void fuzz::tryOne(std::string_view input) {
  const std::string text(input);
  std::istringstream stream(text);
  stream.imbue(std::locale::classic());
  std::uint64_t parent = 0;
  char separator = '\0';
  std::string word;
  stream >> parent >> separator >> word;
  const inventory::InstanceIdParts parts = inventory::parseInstanceId(text);
  promise(parts.parent == parent, "the parent's number differs");
  promise(parts.pathText == word, "the path text differs");

  std::istringstream pathText(text);
  pathText.imbue(std::locale::classic());
  std::uint64_t number = 0;
  pathText >> std::hex >> number;
  promise(inventory::nodeNumber(text) == std::to_string(number), "the node number differs");
}
