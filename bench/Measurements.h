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

/// Resident memory of this process without what its allocator keeps free, in bytes (/proc/self/statm).
std::size_t residentBytes();

}  // namespace bench
