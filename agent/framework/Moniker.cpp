#include <Oru/Moniker.h>

#include <cstdint>
#include <memory>
#include <ostream>
#include <utility>
#include <vector>

namespace Oru {
namespace {

struct Key {
  std::string name;
  std::string value;
  std::uint32_t tag = 0;  // how many keys of the moniker stood before it; goes with the key
};

struct MonikerState {
  std::vector<Key> keys;
  std::uint32_t isSelected = 0;
  std::uint32_t selected = 0;
};

MonikerState& stateOf(void* state) {
  return *static_cast<MonikerState*>(state);
}

const Key* selectedKey(void* opaque) {
  const MonikerState& state = stateOf(opaque);
  return state.isSelected != 0 ? &state.keys[state.selected] : nullptr;
}

}  // namespace

Moniker::Moniker() : state_(std::make_unique<MonikerState>().release()) {}

Moniker::Moniker(const Moniker& other)
    : state_(std::make_unique<MonikerState>(stateOf(other.state_)).release()) {}

Moniker& Moniker::operator=(const Moniker& other) {
  if (this != &other) {
    Moniker copy(other);
    std::swap(state_, copy.state_);
  }
  return *this;
}

Moniker::~Moniker() {
  const std::unique_ptr<MonikerState> owned(&stateOf(state_));
}

void Moniker::addKey(std::string name, const std::string& value) {
  std::vector<Key>& keys = stateOf(state_).keys;
  keys.push_back({std::move(name), value, static_cast<std::uint32_t>(keys.size())});
}

unsigned int Moniker::getKeyCount() const {
  return static_cast<unsigned int>(stateOf(state_).keys.size());
}

bool Moniker::selectKey(unsigned int index) {
  MonikerState& state = stateOf(state_);
  if (index >= state.keys.size()) {
    return false;
  }
  state.isSelected = 1;
  state.selected = index;
  return true;
}

bool Moniker::getName(std::string& name) const {
  const Key* key = selectedKey(state_);
  if (key == nullptr) {
    return false;
  }
  name = key->name;
  return true;
}

bool Moniker::getValue(std::string& value) const {
  const Key* key = selectedKey(state_);
  if (key == nullptr) {
    return false;
  }
  value = key->value;
  return true;
}

std::ostream& operator<<(std::ostream& stream, const std::string& text) {
  return stream.write(text.data(), static_cast<std::streamsize>(text.size()));
}

}  // namespace Oru
