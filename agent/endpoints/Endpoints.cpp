#include <agent/endpoints/Endpoints.h>

#include <utility>

namespace agent::endpoints {
namespace {

/// One text for all keys. Names of a tree hold no control characters, so none runs into the next.
std::string joined(const Keys& keys) {
  std::string text;
  for (const Key& key : keys) {
    text.append(key.value).push_back('\0');
  }
  return text;
}

}  // namespace

std::optional<std::string> ComputerNames::of(Oru::Instrumentation& node) {
  const std::string path = node.getPathToComputer();
  if (path.empty()) {
    return std::nullopt;
  }
  if (path != path_) {
    path_ = path;
    computer_.selectNode(path);
    std::string name;
    const bool named = computer_ && computer_.getProperty(Oru::NodeLexicon::NameProperty, name);
    name_ = named && !name.empty() ? std::optional(std::move(name)) : std::nullopt;
  }
  return name_;
}

// The framework leaves a cursor on no node where a type has none, and throws where it has no tree at all:
// that is a failure, which must not look like a machine without such elements.
Endpoints::Endpoints(const Kind& kind, Passes passes) : kind_(&kind), passes_(std::move(passes)) {
  node_.selectNode(kind.nodes);
  findNext();
}

void Endpoints::operator++() {
  ++node_;
  findNext();
}

void Endpoints::findNext() {
  while (node_ && !takeKeys()) {
    ++node_;
  }
}

/// Whether the node is an element to stop at.
bool Endpoints::takeKeys() {
  if (kind_->isOne != nullptr && !kind_->isOne(node_)) {
    return false;
  }
  std::optional<Keys> keys = kind_->keysOf(node_, computers_);
  if (!keys) {
    ++withoutKeys_;
    return false;
  }
  if (!passes_(*keys)) {
    return false;
  }
  if (!seen_.insert(joined(*keys)).second) {
    ++repeated_;
    return false;
  }
  keys_ = std::move(*keys);
  return true;
}

}  // namespace agent::endpoints
