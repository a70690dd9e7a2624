#include <agent/discovery/Elements.h>
#include <agent/discovery/Values.h>
#include <agent/discovery/network/NetworkFirmware.h>
#include <agent/framework/OwnNumbers.h>

#include <Oru/NodeLexicon.h>

#include <algorithm>
#include <array>
#include <cstddef>
#include <string_view>
#include <utility>

namespace agent::discovery {

namespace {

using Versions = std::vector<DevlinkVersion>;

/// What the name of a version says that it is of.
enum class Kind {
  Whole,    ///< the firmware of the whole device
  Part,     ///< the firmware of a part
  Build,    ///< the build of what is named before ".build"
  Name,     ///< what people call what is named before ".name"
  Details,  ///< the board, an interface between two parts, a package: no firmware that runs
};

constexpr std::string_view buildEnd = ".build";
constexpr std::string_view nameEnd = ".name";

Kind kindOf(std::string_view name) {
  if (name == "fw" || name == "fw.version") {  // one old driver has both, and they are the same
    return Kind::Whole;
  }
  if (name.ends_with(buildEnd)) {
    return Kind::Build;
  }
  if (name.ends_with(nameEnd)) {
    return Kind::Name;
  }
  const bool isDetail = name.starts_with("board.") || name.starts_with("asic.") || name == "fw.psid" ||
                        name.ends_with(".api") || name.ends_with(".bundle_id");
  return isDetail ? Kind::Details : Kind::Part;
}

/// Our own words: what a driver names is no text that tells kinds of elements apart.
std::string descriptionOf(std::string_view name) {
  static constexpr std::array<std::pair<std::string_view, std::string_view>, 9> words{{
      {"fw.mgmt", "Network Control Firmware"},
      {"fw.app", "Network Packet Processing Firmware"},
      {"fw.undi", "Network Option ROM"},
      {"fw.uefi", "Network Option ROM"},
      {"fw.exprom", "Network Option ROM"},
      {"fw.ncsi", "Network Sideband Firmware"},
      {"fw.roce", "Network RDMA Firmware"},
      {"fw.netlist", "Network Board Configuration"},
      {"fw.bootloader", "Network Boot Loader"},
  }};
  const auto known =
      std::find_if(words.begin(), words.end(), [&](const auto& entry) { return entry.first == name; });
  return std::string(known == words.end() ? "Network Component Firmware" : known->second);
}

bool saysSomething(const std::optional<std::string>& version) {
  return version && !isZeroVersion(*version);
}

const std::string* versionNamed(const Versions& versions, std::string_view name) {
  const auto found = std::find_if(versions.begin(), versions.end(),
                                  [&](const DevlinkVersion& known) { return known.name == name; });
  return found == versions.end() || isZeroVersion(found->version) ? nullptr : &found->version;
}

/// Whether the driver info says no more than the running versions in a row: the kernel makes that for drivers
/// that give no firmware version, cut at the width of the field.
bool isKernelMade(const std::string& driver, const DevlinkInfo& info) {
  constexpr std::size_t width = 31;
  std::string row;
  for (const std::string& text : info.runningTexts) {
    row += text + " ";
  }
  return info.runningTexts.size() > 1 && cleanText(row.substr(0, width)) == driver;
}

/// Sets what devlink tells under a name beside the running version.
void setRest(FoundNode& node, const DevlinkInfo& info, const std::string& name) {
  using namespace Oru;
  if (const std::string* build = versionNamed(info.running, name + std::string(buildEnd))) {
    node.setText(NodeLexicon::BuildIdProperty, *build);
  }
  const std::string* const running = versionNamed(info.running, name);
  const std::string* const stored = versionNamed(info.stored, name);
  if (running != nullptr && stored != nullptr && *running != *stored) {
    node.setText(StoredVersionProperty, *stored);
  }
}

/// The running version that is the whole device's: by its name, else the first part with the same version.
const DevlinkVersion* wholeIn(const Versions& running, const std::optional<std::string>& version) {
  const auto named = std::find_if(running.begin(), running.end(), [](const DevlinkVersion& known) {
    return kindOf(known.name) == Kind::Whole && !isZeroVersion(known.version);
  });
  if (named != running.end()) {
    return &*named;
  }
  const auto same = std::find_if(running.begin(), running.end(), [&](const DevlinkVersion& known) {
    return kindOf(known.name) == Kind::Part && known.version == version;
  });
  return same == running.end() ? nullptr : &*same;
}

std::optional<FoundNode> wholeNode(const std::string& address, const FirmwareAnswers& answers,
                                   const DevlinkVersion*& whole) {
  std::vector<std::string> versions;  // the best first
  if (saysSomething(answers.driver) && !isKernelMade(*answers.driver, answers.devlink)) {
    versions.push_back(*answers.driver);
  }
  whole = wholeIn(answers.devlink.running, versions.empty() ? answers.infiniband : versions.front());
  if (whole != nullptr) {
    versions.push_back(whole->version);
  }
  if (saysSomething(answers.infiniband)) {
    versions.push_back(*answers.infiniband);
  }
  if (versions.empty()) {
    return std::nullopt;
  }
  FoundNode node = firmwareNode(address + "/firmware", "Network Firmware", versions.front());
  for (const std::string& version : versions) {
    const std::vector<std::string>& others = node.otherVersions;
    if (version != versions.front() && std::find(others.begin(), others.end(), version) == others.end()) {
      node.otherVersions.push_back(version);
    }
  }
  if (whole != nullptr) {
    setRest(node, answers.devlink, whole->name);
  }
  return node;
}

/// Of ".build" and ".name": what the name belongs to is a running version as well.
bool isAbout(const DevlinkVersion& version, const Versions& running) {
  const std::string_view name = version.name;
  return versionNamed(running, name.substr(0, name.rfind('.'))) != nullptr;
}

}  // namespace

std::vector<FoundNode> firmwareNodes(const std::string& address, const FirmwareAnswers& answers) {
  std::vector<FoundNode> nodes;
  const DevlinkVersion* whole = nullptr;
  if (std::optional<FoundNode> node = wholeNode(address, answers, whole)) {
    nodes.push_back(std::move(*node));
  }
  const Versions& running = answers.devlink.running;
  for (const DevlinkVersion& part : running) {
    if (kindOf(part.name) != Kind::Part || &part == whole || isZeroVersion(part.version)) {
      continue;
    }
    const std::string* const name = versionNamed(running, part.name + std::string(nameEnd));
    FoundNode node = firmwareNode(address + "/firmware/" + part.name, descriptionOf(part.name), part.version,
                                  {name != nullptr ? *name : part.name, std::nullopt});
    setRest(node, answers.devlink, part.name);
    nodes.push_back(std::move(node));
  }
  return nodes;
}

std::optional<std::string> deviceDetails(const DevlinkInfo& info) {
  constexpr std::size_t limit = 1024;
  std::vector<std::string> details;
  for (const DevlinkVersion& fixed : info.fixed) {
    details.push_back(fixed.name + "=" + fixed.version);
  }
  for (const DevlinkVersion& version : info.running) {
    const Kind kind = kindOf(version.name);
    const bool isFirmware = kind == Kind::Whole || kind == Kind::Part;
    if (!isFirmware && (kind == Kind::Details || !isAbout(version, info.running))) {
      details.push_back(version.name + "=" + version.version);
    }
  }
  return details.empty() ? std::nullopt : std::optional(joinNames(details, limit));
}

}  // namespace agent::discovery
