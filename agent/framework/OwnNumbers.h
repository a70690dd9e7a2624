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
      firstOwnNumber,        ///< of a driver: the devices it drives, "BUS:ADDRESS", ", " between two
  PermanentAddressProperty,  ///< of a port: the address its hardware came with, "02:00:5e:10:00:01"
  LinkTechnologyProperty,  ///< of a port: "Ethernet" and the other words of CIM's LinkTechnology, or another
  SpeedProperty,           ///< of a port: the speed of its link as it is now, in Mbit/s (a number)
  StateProperty,  ///< of a computer or a port: "up", "down" (no link), "disabled" or "testing"; of declared
                  ///< firmware: "enabled", "disabled", "standby", "spare", "unavailable" or "other"
  FirmwareIdProperty,     ///< of firmware: the id that it is updated by, often a GUID
  LowestVersionProperty,  ///< of firmware: the lowest version that it may be replaced by
  ImageSizeProperty,      ///< of firmware: the size of its image in bytes (a number)
  UpdateProperty,       ///< of firmware: "updatable" or "not updatable", then ", write-protected" where it is
  LastAttemptProperty,  ///< of firmware: the version of the last attempt to update it, and how that went:
                        ///< "0x00020001: success"
  StoredVersionProperty,  ///< of firmware: the version in the device's memory, where another one runs: it is
                          ///< the one of the device's next start
  DeviceDetailsProperty,  ///< of a device: what its driver tells of it beside versions of firmware,
                          ///< "board.id=K91258-000", ", " between two
};

}  // namespace agent
