// One provider behind the object manager, and what its requests deliver.
#pragma once

#include <cimom/ObjectManager.h>

#include <cstddef>
#include <filesystem>
#include <memory>
#include <string>
#include <vector>

namespace bench {

/// An object manager in which one provider library serves KELVO_SoftwareIdentity.
class Peer {
 public:
  /// `build` is the build folder: lib/ and share/swinv/schema/ are below it.
  Peer(const std::filesystem::path& build, const std::string& provider);

  /// Each returns the number of objects delivered and throws std::runtime_error where the request failed.
  std::size_t instances();
  std::size_t names();
  std::size_t get(const std::string& instanceId);

  /// Asks for an instance that no machine has.
  void askForNothing();

  /// Every instance as a text, to hold two peers against each other.
  std::vector<std::string> describeInstances();
  /// InstanceIDs in the order of delivery.
  std::vector<std::string> instanceIds();

 private:
  std::unique_ptr<cimom::ObjectManager> manager_;
};

/// An object manager with every provider of the build as its registration files have it: software and what it
/// belongs to, and the associations between them.
class Associations {
 public:
  explicit Associations(const std::filesystem::path& build);

  /// The path of the sample machine's computer, and of the software with that InstanceID.
  static std::string computer();
  static std::string software(const std::string& instanceId);

  /// Names at the far ends of the installed-software associations of `path`. Each returns the number of
  /// objects delivered and throws std::runtime_error where the request failed.
  std::size_t installedNames(const std::string& path);
  /// The installed-software associations themselves.
  std::size_t installed();

 private:
  std::unique_ptr<cimom::ObjectManager> manager_;
};

/// Resident memory of this process without what its allocator keeps free, in bytes (/proc/self/statm).
std::size_t residentBytes();

}  // namespace bench
