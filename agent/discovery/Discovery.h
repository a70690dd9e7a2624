// Discovery: the machine below a system root, read into a node tree.
//
// Each source (host, dmi, ipmi, network, drivers and others) is a folder of its own and runs on a thread of
// its own. A source that does not end in time is reported and left behind: what it still does touches nothing
// that others see.
#pragma once

#include <agent/discovery/drivers/ModuleDatabase.h>
#include <agent/discovery/ipmi/IpmiChannel.h>
#include <agent/discovery/network/Ethtool.h>
#include <agent/discovery/network/NetlinkChannel.h>
#include <agent/framework/NodeTree.h>

#include <chrono>
#include <filesystem>
#include <memory>

namespace agent {

struct DiscoveryOptions {
  /// The folder that holds sys/, proc/ and lib/. With another root than "/" nothing asks the running kernel
  /// anything: what only it could answer is reported as absent.
  std::filesystem::path root = "/";

  /// How long each source may take. The sources run side by side, so this bounds the whole as well.
  std::chrono::milliseconds deadline{5000};

  /// Null: the running kernel's where the root is "/", else none.
  std::shared_ptr<discovery::Ethtool> ethtool;

  /// Empty: the running kernel's where the root is "/", else none.
  discovery::NetlinkOpener netlink;

  /// Empty: the running kernel's where the root is "/", else none.
  discovery::IpmiOpener ipmi;

  /// Null: libkmod over root/lib/modules/RELEASE; on the running system, only where it shows no sys/module.
  std::shared_ptr<discovery::ModuleDatabase> modules;
};

/// Reads the machine. Always gives a tree with one computer system; whatever could not be read stands in its
/// reports. Nothing is written anywhere, and nothing needs root. May be called from any thread.
///
/// Below the computer: the system firmware, network devices with their firmware and ports (devices that have
/// both come first, then by bus address), drivers by name.
NodeTree discover(const DiscoveryOptions& options = {});

}  // namespace agent
