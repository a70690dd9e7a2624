// Machines as they are met, each as the text of a `Machine`.
#pragma once

#include "Machine.h"

#include <memory>
#include <string_view>

namespace agent::discovery::test {

/// A rack server: a card with two ports on one function, an onboard card of two functions, a USB adapter of a
/// service processor, a bond, a bridge and a VLAN.
extern const std::string_view server;
/// What its network drivers say.
std::shared_ptr<Ethtool> serverEthtool();

/// A virtual machine with virtio devices, all drivers built in, no DMI, no lib/modules.
extern const std::string_view virtualMachine;

}  // namespace agent::discovery::test
