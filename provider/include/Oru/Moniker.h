// The framework's name of a managed element: an ordered list of keys, each a name and a value.
//
// Threads: one moniker belongs to one thread at a time. Ownership: it owns its keys; a copy is independent.
#pragma once

#include <iosfwd>
#include <string>

#pragma GCC visibility push(default)
namespace Oru {

/// Key names in use: "InstanceID" (software identities), "Name" (computer systems), "DeviceID" (network
/// ports). Names are compared exactly, case included, and the first key with the wanted name wins.
class Moniker {
 public:
  Moniker();
  /// Copies every key in order with its tag word, and the moniker's own scalar state, unchanged.
  Moniker(const Moniker& other);
  Moniker& operator=(const Moniker& other);
  ~Moniker();

  /// Appends a key; also one whose name is there already.
  void addKey(std::string name, const std::string& value);

  /// Number of keys.
  unsigned int getKeyCount() const;

  /// Selects the key at `index`. False, with the selection as it was, when there is none at that index.
  bool selectKey(unsigned int index);

  /// Name of the selected key. False, with `name` untouched, while none is selected.
  bool getName(std::string& name) const;
  /// Value of the selected key. False, with `value` untouched, while none is selected.
  bool getValue(std::string& value) const;

 private:
  void* state_;
};

/// Prints a moniker's text (a key's name or value, an identifier) as it is, without the stream's width and
/// fill.
std::ostream& operator<<(std::ostream& stream, const std::string& text);

}  // namespace Oru
#pragma GCC visibility pop
