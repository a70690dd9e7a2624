// Numbers of this framework's own, beyond the contract's: they start at 1000. Users of the contract carry
// them unchanged; `swinv tree` and inventory files show them.
#pragma once

#include <agent/framework/NodeTree.h>

namespace agent {

enum OwnProperty : int {
  DrivenDevicesProperty =
      firstOwnNumber,  ///< of a driver: the devices it drives, "BUS:ADDRESS", blanks between
};

}  // namespace agent
