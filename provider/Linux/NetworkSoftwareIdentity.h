// Which firmware a network port has, and which port firmware belongs to: by their common network device.
#pragma once

#include <Oru/Instrumentation.h>
#include <Oru/Moniker.h>

namespace Oru::SoftwareInventoryProfileProvider {

/// A cursor that each operation selects anew and leaves where its walk ended. Arguments are read alone, but
/// for their key selection. Operations throw `Oru::InstrumentationException` and `Oru::FrameworkException`;
/// any other exception that comes out of them ends the process.
class NetworkSoftwareIdentity : public Instrumentation {
 public:
  NetworkSoftwareIdentity();
  ~NetworkSoftwareIdentity();

  /// The firmware of the first network device: the key InstanceID is the device's node number. Where there is
  /// no device it is the number of whatever path the framework has for a cursor on no node.
  Moniker getSoftwareIdentityMoniker();

  /// From a port (key DeviceID) to the firmware of its device: the key InstanceID is the device's node
  /// number.
  Moniker getSoftwareIdentityMoniker(Moniker& monikerNetwork);

  /// From firmware (key InstanceID, or a parent's number alone) to the first port of its device (key
  /// DeviceID).
  Moniker getNetworkPortMoniker(Moniker& monikerIdentity);
};

}  // namespace Oru::SoftwareInventoryProfileProvider
