// The framework's contract over the scripted world.
#include <Oru/Exceptions.h>
#include <Oru/Instrumentation.h>
#include <Oru/Moniker.h>

#include <ostream>
#include <utility>

#include "StandIn.h"

namespace Oru {

namespace {

using standin::Node;
using standin::world;

std::string quoted(const std::string& text) {
  return "\"" + text + "\"";
}

std::string pathOf(const std::string& text) {
  return text.empty() ? "" : "/" + text;
}

struct Cursor {
  std::vector<const Node*> selected;
  std::vector<const Node*> walk;  ///< those of the selected nodes that pass the filter
  std::size_t at = 0;

  [[nodiscard]] const Node* node() const { return at < walk.size() ? walk[at] : nullptr; }
  void leave() { walk.clear(); }
};

Cursor& cursor(void* state) {
  return *static_cast<Cursor*>(state);
}

bool isBelow(const Node& node, const std::string& ancestor) {
  for (const Node* at = world().find(node.parent); at != nullptr; at = world().find(at->parent)) {
    if (pathOf(at->text) == ancestor) {
      return true;
    }
  }
  return pathOf(node.parent) == ancestor;
}

}  // namespace

Instrumentation::Instrumentation() : state_(new Cursor) {
  world().record("Instrumentation()", false, false);
}
Instrumentation::~Instrumentation() {
  delete static_cast<Cursor*>(state_);
}

void Instrumentation::selectNode(NodeLexicon::NodeType type) {
  Cursor& self = cursor(state_);
  self = {};
  const bool fails = world().record("selectNode(" + std::to_string(type) + ")", true);
  for (const Node& node : world().nodes) {
    if (node.type == type && !fails) {
      self.selected.push_back(&node);
    }
  }
  self.walk = self.selected;
  if (self.walk.empty() && !fails && world().missingTypeThrows) {
    throw InstrumentationException("no node of that type");
  }
}

void Instrumentation::selectNode(const std::string& path) {
  Cursor& self = cursor(state_);
  self = {};
  if (world().record("selectNode(" + quoted(path) + ")", true)) {
    return;
  }
  if (const Node* node = path.empty() ? nullptr : world().find(path.substr(1))) {
    self.selected.push_back(node);
  }
  self.walk = self.selected;
}

void Instrumentation::setFilter(NodeLexicon::PathType type, const std::string& path) {
  Cursor& self = cursor(state_);
  self.walk.clear();
  self.at = 0;
  if (world().record("setFilter(" + std::to_string(type) + "," + quoted(path) + ")", true)) {
    return;
  }
  for (const Node* node : self.selected) {
    if (type == NodeLexicon::ExactPath ? pathOf(node->text) == path : isBelow(*node, path)) {
      self.walk.push_back(node);
    }
  }
  if (self.walk.empty() && world().emptyFilterThrows) {
    throw InstrumentationException("nothing passes the filter");
  }
}

Instrumentation::operator bool() {
  const bool fails = world().record("operator bool", true);
  return !fails && cursor(state_).node() != nullptr;
}

void Instrumentation::operator++() {
  Cursor& self = cursor(state_);
  if (world().record("operator++", true)) {
    self.leave();
  }
  ++self.at;
}

std::string Instrumentation::getPathToNode() {
  const Node* node = cursor(state_).node();
  return world().record("getPathToNode", true) || node == nullptr ? "" : pathOf(node->text);
}

std::string Instrumentation::getPathToParentNode() {
  const Node* node = cursor(state_).node();
  return world().record("getPathToParentNode", true) || node == nullptr ? "" : pathOf(node->parent);
}

std::string Instrumentation::getPathToComputer() {
  const Node* node = cursor(state_).node();
  return world().record("getPathToComputer", true) || node == nullptr ? "" : pathOf(node->computer);
}

std::string Instrumentation::convertPathToString(const std::string& path) {
  const bool fails = world().record("convertPathToString(" + quoted(path) + ")", true);
  return fails || path.empty() ? "" : path.substr(1);
}

std::string Instrumentation::convertStringToPath(const std::string& text) {
  const bool fails = world().record("convertStringToPath(" + quoted(text) + ")", true);
  return fails ? "" : "/" + text;
}

std::string Instrumentation::getNodeDescription() {
  const Node* node = cursor(state_).node();
  return world().record("getNodeDescription", true) || node == nullptr ? "" : node->description;
}

int Instrumentation::getSensorType() {
  const Node* node = cursor(state_).node();
  return world().record("getSensorType", true) || node == nullptr ? -1
                                                                  : node->sensorType.value_or(node->type);
}

bool Instrumentation::getProperty(NodeLexicon::Properties property, std::string& value) {
  const Node* node = cursor(state_).node();
  const bool fails = world().record("getProperty(" + std::to_string(property) + ",string)", true);
  if (fails || node == nullptr || !node->texts.contains(property)) {
    return false;
  }
  value = node->texts.at(property);
  return true;
}

bool Instrumentation::getProperty(NodeLexicon::Properties property, unsigned int& value) {
  const Node* node = cursor(state_).node();
  const bool fails = world().record("getProperty(" + std::to_string(property) + ",number)", true);
  if (fails || node == nullptr || !node->numbers.contains(property)) {
    return false;
  }
  value = node->numbers.at(property);
  return true;
}

bool Instrumentation::setProperty(NodeLexicon::Properties property, std::vector<unsigned int> values) {
  const bool fails = world().record("setProperty(" + std::to_string(property) + ")", true);
  world().written = std::move(values);
  return !fails && world().writeSucceeds;
}

namespace {

struct Keys {
  std::vector<std::pair<std::string, std::string>> list;
  std::size_t selected = ~std::size_t{0};
};

Keys& keys(void* state) {
  return *static_cast<Keys*>(state);
}

}  // namespace

Moniker::Moniker() : state_(new Keys) {}
Moniker::Moniker(const Moniker& other) : state_(new Keys(keys(other.state_))) {}
Moniker& Moniker::operator=(const Moniker& other) {
  if (this != &other) {
    keys(state_) = keys(other.state_);
  }
  return *this;
}
Moniker::~Moniker() {
  delete static_cast<Keys*>(state_);
}
void Moniker::addKey(std::string name, const std::string& value) {
  keys(state_).list.emplace_back(std::move(name), value);
}
unsigned int Moniker::getKeyCount() const {
  return static_cast<unsigned int>(keys(state_).list.size());
}
bool Moniker::selectKey(unsigned int index) {
  const bool there = index < keys(state_).list.size();
  if (there) {
    keys(state_).selected = index;
  }
  return there;
}
bool Moniker::getName(std::string& name) const {
  const Keys& self = keys(state_);
  if (self.selected >= self.list.size()) {
    return false;
  }
  name = self.list[self.selected].first;
  return true;
}
bool Moniker::getValue(std::string& value) const {
  const Keys& self = keys(state_);
  if (self.selected >= self.list.size()) {
    return false;
  }
  value = self.list[self.selected].second;
  return true;
}

std::ostream& operator<<(std::ostream& stream, const std::string& text) {
  return stream.write(text.data(), static_cast<std::streamsize>(text.size()));
}

InstrumentationException::InstrumentationException(const char* message) : message_(message) {}
InstrumentationException::InstrumentationException(const InstrumentationException&) = default;
InstrumentationException& InstrumentationException::operator=(const InstrumentationException&) = default;
InstrumentationException::~InstrumentationException() = default;
const char* InstrumentationException::what() const noexcept {
  return message_.c_str();
}

FrameworkException::FrameworkException(const char* message) : message_(message) {}
FrameworkException::FrameworkException(const FrameworkException&) = default;
FrameworkException& FrameworkException::operator=(const FrameworkException&) = default;
FrameworkException::~FrameworkException() = default;
const char* FrameworkException::what() const noexcept {
  return message_.c_str();
}

ProviderException::ProviderException(const char* message) : message_(message) {}
ProviderException::ProviderException(const ProviderException&) = default;
ProviderException& ProviderException::operator=(const ProviderException&) = default;
ProviderException::~ProviderException() = default;
const char* ProviderException::what() const noexcept {
  return message_.c_str();
}

}  // namespace Oru
