// A machine of any number of devices, written as a system root.
#pragma once

#include <agent/discovery/Discovery.h>
#include <tests/agent/discovery/Machine.h>

#include <cstddef>

namespace bench {

/// A system root with that many PCI devices: a quarter each of network cards, NVMe drives, SCSI drives and
/// graphics processors. Each device has firmware, which an SMBIOS table declares once more; there is a driver
/// for each kind, and one more for every ten devices, that every tenth has for itself. The BIOS comes on top.
/// The files are removed at the end.
class GeneratedMachine {
 public:
  explicit GeneratedMachine(std::size_t devices);

  /// The root, and doubles of the drivers that would be asked by ioctl and of the kernel's module files.
  [[nodiscard]] const agent::DiscoveryOptions& options() const { return options_; }

  /// How many nodes the tree of a discovery has to have.
  [[nodiscard]] std::size_t nodes() const { return nodes_; }

 private:
  std::size_t nodes_;
  agent::discovery::test::Machine machine_;
  agent::DiscoveryOptions options_;
};

}  // namespace bench
