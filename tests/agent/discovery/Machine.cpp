#include "Machine.h"

#include <linux/ethtool.h>

#include <algorithm>
#include <cerrno>
#include <cstdlib>
#include <cstring>
#include <fstream>
#include <stdexcept>
#include <utility>

namespace agent::discovery::test {

namespace fs = std::filesystem;

Machine::Machine(std::string_view description) {
  std::string pattern = (fs::temp_directory_path() / "machine-XXXXXX").string();
  if (::mkdtemp(pattern.data()) == nullptr) {
    throw std::runtime_error("no temporary folder " + pattern + ": " + std::strerror(errno));
  }
  root_ = pattern;
  add(description);
}

Machine::~Machine() {
  std::error_code ignored;
  fs::remove_all(root_, ignored);
}

void Machine::add(std::string_view description) {
  while (!description.empty()) {
    const std::size_t end = std::min(description.find('\n'), description.size());
    addLine(description.substr(0, end));
    description.remove_prefix(std::min(end + 1, description.size()));
  }
}

void Machine::addLine(std::string_view line) {
  static constexpr std::string_view link = " -> ";
  static constexpr std::string_view file = " = ";
  line.remove_prefix(std::min(line.find_first_not_of(' '), line.size()));
  if (line.empty() || line.starts_with('#')) {
    return;
  }
  if (const std::size_t arrow = line.find(link); arrow != std::string_view::npos) {
    const fs::path path = root_ / line.substr(0, arrow);
    fs::create_directories(path.parent_path());
    fs::remove(path);
    fs::create_symlink(line.substr(arrow + link.size()), path);
  } else if (const std::size_t equals = line.find(file); equals != std::string_view::npos) {
    write(std::string(line.substr(0, equals)), std::string(line.substr(equals + file.size())) + "\n");
  } else if (line.ends_with('/')) {
    fs::create_directories(root_ / line);
  } else {
    throw std::invalid_argument("no line of a machine: " + std::string(line));
  }
}

void Machine::write(const std::string& path, std::string_view bytes) {
  fs::create_directories((root_ / path).parent_path());
  std::ofstream stream(root_ / path, std::ios::binary | std::ios::trunc);
  stream.write(bytes.data(), static_cast<std::streamsize>(bytes.size()));
  if (!stream.flush()) {
    throw std::runtime_error("cannot write " + path);
  }
}

void Machine::remove(const std::string& path) {
  if (fs::remove_all(root_ / path) == 0) {
    throw std::runtime_error("nothing to remove at " + path);
  }
}

Ethtool::Answer FakeEthtool::driverInfo(const std::string& interfaceName) {
  const auto told = told_.find(interfaceName);
  if (told == told_.end()) {
    return {ENODEV, {}};
  }
  if (told->second.error != 0) {
    return {told->second.error, {}};
  }
  return {0, driverInfoBytes(told->second.version, told->second.firmware)};
}

Ethtool::Answer FakeEthtool::permanentAddress(const std::string& interfaceName) {
  const auto told = told_.find(interfaceName);
  if (told == told_.end() || told->second.address.empty()) {
    return {EOPNOTSUPP, {}};
  }
  return {0, told->second.address};
}

std::string driverInfoBytes(std::string_view version, std::string_view firmware) {
  ethtool_drvinfo info{};
  std::memcpy(info.version, version.data(), std::min(version.size(), sizeof info.version));
  std::memcpy(info.fw_version, firmware.data(), std::min(firmware.size(), sizeof info.fw_version));
  return {reinterpret_cast<const char*>(&info), sizeof info};
}

ModuleDatabase::Answer FakeModules::version(const std::string& module) {
  const auto known = known_.find(module);
  return known == known_.end() ? Answer{ENOENT, std::nullopt} : known->second;
}

NodeTree discoverAt(const Machine& machine, std::shared_ptr<Ethtool> ethtool,
                    std::shared_ptr<ModuleDatabase> modules) {
  DiscoveryOptions options;
  options.root = machine.root();
  options.deadline = std::chrono::seconds(60);  // a loaded test machine is no reason to miss a node
  options.ethtool = std::move(ethtool);
  options.modules = std::move(modules);
  return discover(options);
}

std::string shown(const NodeTree& tree) {
  std::string text;
  for (NodeTree::Index node = 0; node < tree.size(); ++node) {
    for (NodeTree::Index above = tree.parent(node); above != NodeTree::none; above = tree.parent(above)) {
      text += "  ";
    }
    text += std::to_string(tree.type(node)) + " " + std::string(tree.description(node));
    for (const PropertyView& property : tree.properties(node)) {
      text += " " + std::to_string(property.id) + "=";
      text += property.isText ? "\"" + std::string(property.text) + "\"" : std::to_string(property.number);
    }
    text += "\n";
  }
  return text;
}

NodeTree::Index described(const NodeTree& tree, std::string_view description) {
  for (NodeTree::Index node = 0; node < tree.size(); ++node) {
    if (tree.description(node) == description) {
      return node;
    }
  }
  return NodeTree::none;
}

std::optional<SourceReport> reportOn(const NodeTree& tree, std::string_view source,
                                     std::string_view pathEnd) {
  const auto& reports = tree.reports();
  const auto found = std::find_if(reports.begin(), reports.end(), [&](const SourceReport& report) {
    return report.source == source && report.path.ends_with(pathEnd);
  });
  return found == reports.end() ? std::nullopt : std::optional(*found);
}

}  // namespace agent::discovery::test
