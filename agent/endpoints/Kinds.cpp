// The three kinds: which nodes they are, and how what these tell reads in CIM.
#include <agent/endpoints/Endpoints.h>
#include <agent/framework/OwnNumbers.h>

#include <algorithm>
#include <array>
#include <string_view>
#include <utility>

namespace agent::endpoints {
namespace {

using Oru::Instrumentation;
namespace lexicon = Oru::NodeLexicon;

constexpr const char* computerClass = "KELVO_ComputerSystem";
constexpr const char* controllerClass = "KELVO_SPComputerSystem";
constexpr const char* portClass = "KELVO_NetworkPort";

/// How the firmware of a management controller is described.
constexpr std::string_view controllerFirmware = "BMC Firmware";

struct Word {
  std::string_view text;
  std::uint16_t number;
};

// CIM_EnabledLogicalElement.EnabledState.
constexpr std::uint16_t enabled = 2;
constexpr std::array<Word, 4> enabledStates{{
    {"up", enabled},
    {"disabled", 3},  // Disabled
    {"down", 6},      // Enabled but Offline
    {"testing", 7},   // In Test
}};

// CIM_NetworkPort.LinkTechnology; 0 is Unknown.
constexpr std::uint16_t otherTechnology = 1;
constexpr std::array<Word, 10> linkTechnologies{{
    {"Ethernet", 2},
    {"IB", 3},
    {"FC", 4},
    {"FDDI", 5},
    {"ATM", 6},
    {"Token Ring", 7},
    {"Frame Relay", 8},
    {"Infrared", 9},
    {"BlueTooth", 10},
    {"Wireless LAN", 11},
}};

// CIM_ComputerSystem.Dedicated.
constexpr std::uint16_t notDedicated = 0;
constexpr std::uint16_t managementController = 28;

constexpr std::uint64_t bitsPerMegabit = 1'000'000;

std::optional<std::uint16_t> numberOf(std::span<const Word> words, std::string_view text) {
  const auto found =
      std::find_if(words.begin(), words.end(), [&](const Word& word) { return word.text == text; });
  return found == words.end() ? std::nullopt : std::optional(found->number);
}

/// The contract names its own properties; a framework may know more, such as this agent's own.
constexpr lexicon::Properties own(OwnProperty property) {
  return static_cast<lexicon::Properties>(property);
}

std::optional<std::string> textOf(Instrumentation& node, lexicon::Properties property) {
  std::string text;
  return node.getProperty(property, text) && !text.empty() ? std::optional(std::move(text)) : std::nullopt;
}

void addElementName(std::vector<Property>& properties, std::optional<std::string> name) {
  if (name) {
    properties.push_back({"ElementName", std::move(*name)});
  }
}

void addEnabledState(std::vector<Property>& properties, Instrumentation& node) {
  const auto state = textOf(node, own(StateProperty));
  if (const auto number = state ? numberOf(enabledStates, *state) : std::nullopt) {
    properties.push_back({"EnabledState", *number});
  }
}

std::vector<Property> systemProperties(Instrumentation& node, std::uint16_t dedicated) {
  std::vector<Property> properties;
  addElementName(properties, textOf(node, lexicon::NameProperty));
  properties.push_back({"Dedicated", std::vector{dedicated}});
  return properties;
}

std::optional<Keys> systemKeys(const char* className, std::optional<std::string> name) {
  if (!name) {
    return std::nullopt;
  }
  return Keys{{"CreationClassName", className}, {"Name", std::move(*name)}};
}

// ---- Computers: each node of a computer system.

std::optional<Keys> computerKeys(Instrumentation& node, ComputerNames& /*computers*/) {
  return systemKeys(computerClass, textOf(node, lexicon::NameProperty));
}

std::vector<Property> computerProperties(Instrumentation& node) {
  std::vector<Property> properties = systemProperties(node, notDedicated);
  addEnabledState(properties, node);
  return properties;
}

// ---- Management controllers: the nodes of their firmware. A controller bears the name of the computer above
// it.

bool isControllerFirmware(Instrumentation& node) {
  return node.getNodeDescription() == controllerFirmware;
}

std::optional<Keys> controllerKeys(Instrumentation& node, ComputerNames& computers) {
  return systemKeys(controllerClass, computers.of(node));
}

// Firmware that is in use runs on a controller that is enabled; of its other states (a spare image, say) the
// controller has none.
std::vector<Property> controllerProperties(Instrumentation& node) {
  std::vector<Property> properties = systemProperties(node, managementController);
  if (textOf(node, own(StateProperty)) == "enabled") {
    properties.push_back({"EnabledState", enabled});
  }
  return properties;
}

// ---- Network ports.

std::optional<Keys> portKeys(Instrumentation& node, ComputerNames& computers) {
  std::optional<std::string> computer = computers.of(node);
  std::optional<std::string> device = textOf(node, lexicon::NameProperty);
  if (!computer || !device) {
    return std::nullopt;
  }
  return Keys{{"SystemCreationClassName", computerClass},
              {"SystemName", std::move(*computer)},
              {"CreationClassName", portClass},
              {"DeviceID", std::move(*device)}};
}

void addLinkTechnology(std::vector<Property>& properties, Instrumentation& node) {
  std::optional<std::string> technology = textOf(node, own(LinkTechnologyProperty));
  if (!technology) {
    return;
  }
  const auto number = numberOf(linkTechnologies, *technology);
  properties.push_back({"LinkTechnology", number.value_or(otherTechnology)});
  if (!number) {
    properties.push_back({"OtherLinkTechnology", std::move(*technology)});
  }
}

std::vector<Property> portProperties(Instrumentation& node) {
  std::vector<Property> properties;
  const std::string interface = node.getNodeDescription();
  addElementName(properties, interface.empty() ? std::nullopt : std::optional(interface));
  if (std::optional<std::string> address = textOf(node, own(PermanentAddressProperty))) {
    std::erase(*address, ':');  // CIM has the digits without anything between them
    properties.push_back({"PermanentAddress", std::move(*address)});
  }
  addLinkTechnology(properties, node);
  if (unsigned int megabits = 0; node.getProperty(own(SpeedProperty), megabits)) {
    properties.push_back({"Speed", megabits * bitsPerMegabit});
  }
  addEnabledState(properties, node);
  return properties;
}

constexpr std::array systemKeyNames{"CreationClassName", "Name"};
constexpr std::array portKeyNames{"SystemCreationClassName", "SystemName", "CreationClassName", "DeviceID"};

constexpr std::array<Kind, 3> kinds{{
    {1, computerClass, systemKeyNames, lexicon::ComputerSystemNode, nullptr, computerKeys,
     computerProperties},
    {119, controllerClass, systemKeyNames, lexicon::FirmwareNode, isControllerFirmware, controllerKeys,
     controllerProperties},
    {17, portClass, portKeyNames, lexicon::NetworkPortNode, nullptr, portKeys, portProperties},
}};

}  // namespace

const Kind* kindOf(unsigned short classId) {
  const auto* found =
      std::find_if(kinds.begin(), kinds.end(), [&](const Kind& kind) { return kind.classId == classId; });
  return found == kinds.end() ? nullptr : found;
}

std::string classNames() {
  std::string names;
  for (const Kind& kind : kinds) {
    names.append(names.empty() ? "" : ", ").append(kind.className);
  }
  return names;
}

}  // namespace agent::endpoints
