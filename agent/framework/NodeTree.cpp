#include <agent/framework/Mix.h>
#include <agent/framework/NodeTree.h>

#include <algorithm>
#include <bit>
#include <numeric>

namespace agent {

std::vector<PropertyView> NodeTree::properties(Index node) const {
  std::vector<PropertyView> all;
  all.reserve(nodes_[node].propertyCount);
  const Property* begin = properties_.data() + nodes_[node].firstProperty;
  for (const Property& property : std::span(begin, nodes_[node].propertyCount)) {
    if (property.isText != 0) {
      all.push_back({property.id, true, 0, view(property.textOrNumber)});
    } else {
      all.push_back({property.id, false, property.textOrNumber.begin, {}});
    }
  }
  return all;
}

std::span<const NodeTree::Index> NodeTree::ofType(int type) const {
  // A tree has a handful of types: looking at each is faster than halving.
  const auto found = std::find_if(typeRanges_.begin(), typeRanges_.end(),
                                  [type](const TypeRange& range) { return range.type >= type; });
  if (found == typeRanges_.end() || found->type != type) {
    return {};
  }
  return std::span(byType_).subspan(found->begin, found->end - found->begin);
}

NodeTree::Index NodeTree::find(NodeNumber number) const {
  if (nodes_.empty()) {
    return none;
  }
  const std::uint64_t wanted = mix64(number);
  const std::size_t bucket = wanted >> static_cast<unsigned int>(bucketShift_);
  const Index* begin = byNumber_.data() + bucketBegins_[bucket];
  const Index* end = byNumber_.data() + bucketBegins_[bucket + 1];
  const Index* found = std::lower_bound(begin, end, wanted, [this](Index node, std::uint64_t mixed) {
    return mix64(nodes_[node].number) < mixed;
  });
  return found != end && nodes_[*found].number == number ? *found : none;
}

void NodeTree::indexTypes() {
  byType_.resize(nodes_.size());
  std::iota(byType_.begin(), byType_.end(), Index{0});
  std::stable_sort(byType_.begin(), byType_.end(),
                   [this](Index left, Index right) { return nodes_[left].type < nodes_[right].type; });
  for (std::uint32_t i = 0; i < byType_.size(); ++i) {
    const std::int32_t type = nodes_[byType_[i]].type;
    if (typeRanges_.empty() || typeRanges_.back().type != type) {
      typeRanges_.push_back({type, i, i});
    }
    typeRanges_.back().end = i + 1;
  }
}

void NodeTree::indexNumbers() {
  // As many buckets as nodes, or up to twice as many; two at least, so that the shift stays below 64.
  const int bits = std::max(1, static_cast<int>(std::bit_width(nodes_.size())));
  bucketShift_ = 64 - bits;
  const auto bucketOf = [this](Index node) -> std::size_t {
    return mix64(nodes_[node].number) >> static_cast<unsigned int>(bucketShift_);
  };

  bucketBegins_.assign((std::size_t{1} << static_cast<unsigned int>(bits)) + 1, 0);
  for (Index node = 0; node < nodes_.size(); ++node) {
    ++bucketBegins_[bucketOf(node) + 1];
  }
  std::partial_sum(bucketBegins_.begin(), bucketBegins_.end(), bucketBegins_.begin());

  byNumber_.resize(nodes_.size());
  std::vector<std::uint32_t> next = bucketBegins_;
  for (Index node = 0; node < nodes_.size(); ++node) {
    byNumber_[next[bucketOf(node)]++] = node;
  }
  for (std::size_t bucket = 0; bucket + 1 < bucketBegins_.size(); ++bucket) {
    std::sort(
        byNumber_.begin() + bucketBegins_[bucket], byNumber_.begin() + bucketBegins_[bucket + 1],
        [this](Index left, Index right) { return mix64(nodes_[left].number) < mix64(nodes_[right].number); });
  }
}

bool operator==(const NodeTree& left, const NodeTree& right) {
  if (left.size() != right.size() || left.reports_ != right.reports_) {
    return false;
  }
  // The pools of two equal trees may be laid out differently, so nodes are compared by what they say.
  for (NodeTree::Index node = 0; node < left.size(); ++node) {
    if (left.type(node) != right.type(node) || left.number(node) != right.number(node) ||
        left.parent(node) != right.parent(node) || left.description(node) != right.description(node) ||
        left.position(node) != right.position(node) || left.properties(node) != right.properties(node)) {
      return false;
    }
  }
  return true;
}

}  // namespace agent
