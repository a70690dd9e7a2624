// Random node trees: of any shape, with any texts, the same for the same seed.
#pragma once

#include <agent/framework/NodeTree.h>

#include <random>
#include <string>

namespace agent::testing {

class RandomTree {
 public:
  explicit RandomTree(std::uint64_t seed) : random_(seed) {}

  NodeTree make(std::size_t largest);

  std::size_t below(std::size_t bound) {
    return std::uniform_int_distribution<std::size_t>(0, bound - 1)(random_);
  }
  bool oneIn(std::size_t bound) { return below(bound) == 0; }
  /// A text of pieces that are hard on parsers and writers.
  std::string text();

 private:
  void setProperties(NodeTreeBuilder& builder, NodeTreeBuilder::Handle node);

  std::mt19937_64 random_;
};

}  // namespace agent::testing
