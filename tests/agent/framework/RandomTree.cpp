#include "RandomTree.h"

#include <array>

namespace agent::testing {

std::string RandomTree::text() {
  static const std::array<std::string, 14> pieces{
      "a",    "BIOS", " ",     "\t",           "\"",       "\\",           "/",
      "\xff", "\n",   "Grüße", "\xE2\x82\xAC", "\xC2\x85", "\xED\xA0\x80", "\x01"};
  std::string text;
  for (std::size_t i = below(6); i > 0; --i) {
    text += pieces.at(below(pieces.size()));
  }
  return text;
}

void RandomTree::setProperties(NodeTreeBuilder& builder, NodeTreeBuilder::Handle node) {
  static const std::array<int, 9> ids{0, 36, 104, 107, 108, 307, 1000, 4711, 2147483647};
  for (std::size_t i = below(5); i > 0; --i) {
    const int id = ids.at(below(ids.size()));
    if (oneIn(2)) {
      builder.setText(node, id, text());
    } else {
      builder.setValue(node, id, static_cast<std::uint32_t>(random_()));
    }
  }
}

NodeTree RandomTree::make(std::size_t largest) {
  static const std::array<int, 10> types{2, 3, 12, 40, 43, 44, 49, 0, 1000, 2147483647};
  NodeTreeBuilder builder;
  const std::size_t size = below(largest + 1);
  for (std::size_t i = 0; i < size; ++i) {
    const bool isRoot = i == 0 || oneIn(8);
    // Near the end of what is there, so that trees grow deep as well as wide.
    const std::size_t back = isRoot ? 0 : below(std::min<std::size_t>(i, 12));
    const auto node = builder.add(isRoot ? NodeTreeBuilder::noParent : i - 1 - back,
                                  types.at(below(types.size())), text(), text());
    if (oneIn(20)) {
      builder.setNumber(node, random_() | 2U);
    }
    setProperties(builder, node);
  }
  for (std::size_t i = below(3); i > 0; --i) {
    builder.addReport({text(), text(), static_cast<SourceReport::Reason>(below(4)), text()});
  }
  return builder.build();
}

}  // namespace agent::testing
