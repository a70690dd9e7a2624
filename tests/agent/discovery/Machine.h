// A machine described as text, built as files below a temporary folder.
#pragma once

#include <agent/discovery/Discovery.h>
#include <agent/framework/NodeTree.h>

#include <filesystem>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace agent::discovery::test {

/// A folder below the system's temporary one, removed at the end.
///
/// A description has one file for each line, folders come by themselves:
///
///   sys/class/dmi/id/bios_vendor = Corvane           a file with that text and a newline
///   sys/class/net/eth0 -> ../../devices/virtual/lo   a symbolic link
///   sys/bus/                                         a folder
///   # a comment
class Machine {
 public:
  explicit Machine(std::string_view description);
  Machine(const Machine&) = delete;
  Machine& operator=(const Machine&) = delete;
  ~Machine();

  [[nodiscard]] const std::filesystem::path& root() const { return root_; }

  /// Adds to what there is, replacing files and links of the same name.
  void add(std::string_view description);
  /// Writes a file byte by byte.
  void write(const std::string& path, std::string_view bytes);
  void remove(const std::string& path);

 private:
  void addLine(std::string_view line);

  std::filesystem::path root_;
};

/// Drivers that answer as a test tells them to; any other interface gets ENODEV.
class FakeEthtool : public Ethtool {
 public:
  struct Told {
    std::string version;
    std::string firmware;
    int error = 0;
    std::string address = {};  ///< the permanent address's bytes; none: the driver does not tell
  };

  explicit FakeEthtool(std::map<std::string, Told> told) : told_(std::move(told)) {}
  Answer driverInfo(const std::string& interfaceName) override;
  Answer permanentAddress(const std::string& interfaceName) override;

 private:
  std::map<std::string, Told> told_;
};

/// The bytes of a driver-info answer.
std::string driverInfoBytes(std::string_view version, std::string_view firmware);

/// Knows the versions that a test gives it; any other module gets ENOENT.
class FakeModules : public ModuleDatabase {
 public:
  explicit FakeModules(std::map<std::string, Answer> known) : known_(std::move(known)) {}
  Answer version(const std::string& module) override;

 private:
  std::map<std::string, Answer> known_;
};

NodeTree discoverAt(const Machine& machine, std::shared_ptr<Ethtool> ethtool = nullptr,
                    std::shared_ptr<ModuleDatabase> modules = nullptr);

/// The tree, one line for a node, two blanks for a level: `TYPE DESCRIPTION ID=VALUE ...`, texts in quotes.
std::string shown(const NodeTree& tree);

/// The first node with that description, or `NodeTree::none`.
NodeTree::Index described(const NodeTree& tree, std::string_view description);

/// The report of a source on a path that ends so.
std::optional<SourceReport> reportOn(const NodeTree& tree, std::string_view source, std::string_view pathEnd);

}  // namespace agent::discovery::test
