// Numbers of this framework's own, beyond the contract's: they start at 1000. Users of the contract carry
// them unchanged; `swinv tree` and inventory files show them.
#pragma once

#include <agent/framework/NodeTree.h>

namespace agent {

enum OwnNodeType : int {
  DeviceNode = firstOwnNumber,  ///< a part that the contract has no type for (a drive, a processor), above
                                ///< its firmware
};

enum OwnProperty : int {
  DrivenDevicesProperty =
      firstOwnNumber,  ///< of a driver: the devices it drives, "BUS:ADDRESS", ", " between two
};

}  // namespace agent
