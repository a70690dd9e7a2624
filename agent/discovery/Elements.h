// The shapes in which sources put devices and their firmware into the tree.
#pragma once

#include <agent/discovery/Source.h>
#include <agent/framework/OwnNumbers.h>

#include <Oru/NodeLexicon.h>

#include <optional>
#include <string>
#include <utility>

namespace agent::discovery {

/// What a part of the machine says of itself.
struct Label {
  std::optional<std::string> name;   ///< its model
  std::optional<std::string> maker;  ///< who made it
};

/// Firmware with its version; `description` is one of the source's own words.
inline FoundNode firmwareNode(std::string position, std::string description, const std::string& version,
                              const Label& label = {}) {
  FoundNode node{Oru::NodeLexicon::FirmwareNode, std::move(position), std::move(description), {}, {}, {}};
  node.setText(Oru::NodeLexicon::NameProperty, label.name);
  node.setText(Oru::NodeLexicon::ManufacturerProperty, label.maker);
  node.setText(Oru::NodeLexicon::VersionStringProperty, version);
  return node;
}

/// A device that the contract has no type for; what belongs to it goes below.
inline FoundNode deviceNode(std::string position, std::string description, const Label& label = {}) {
  FoundNode node{DeviceNode, std::move(position), std::move(description), {}, {}, {}};
  node.setText(Oru::NodeLexicon::NameProperty, label.name);
  node.setText(Oru::NodeLexicon::ManufacturerProperty, label.maker);
  return node;
}

}  // namespace agent::discovery
