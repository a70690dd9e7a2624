// The association KELVO_NetworkSoftwareIdentity: the firmware of a network device and its network port.
#pragma once

#include <cmpi/cmpidt.h>

#include "AssociationAdapter.h"
#include "CMPINetworkPort.h"
#include "Linux/NetworkSoftwareIdentity.h"

namespace Oru::SoftwareInventoryProfileProvider {

/// The reference Antecedent holds the firmware's KELVO_SoftwareIdentity, Dependent a KELVO_NetworkPort.
///
/// From a port the walk is over all firmware of its device; from firmware over its device's first port; from
/// the association class over the firmware of the first network device alone, each paired with that device's
/// first port.
class CMPINetworkSoftwareIdentity : public AssociationAdapter<CMPISINetworkPort, NetworkSoftwareIdentity> {
 public:
  /// Throws what the resolver and the ends throw.
  CMPINetworkSoftwareIdentity(const CMPIBroker* broker, const CMPIContext* context,
                              const CMPIObjectPath* objectPath);
  ~CMPINetworkSoftwareIdentity();
  CMPINetworkSoftwareIdentity(const CMPINetworkSoftwareIdentity&) = delete;
  CMPINetworkSoftwareIdentity& operator=(const CMPINetworkSoftwareIdentity&) = delete;

  /// It asks the port end, whose answer has side effects: as often as it is written.
  explicit operator bool();
  void operator++();

  /// From a software path to the path of its port; a path without keys stays bare, which means every port.
  CMPIObjectPath* locateNetwork(const CMPIObjectPath* objectPath);
  /// From a port's path to the path that selects its device's firmware; a path without keys means the first
  /// network device.
  CMPIObjectPath* locateIdentity(const CMPIObjectPath* objectPath);
};

}  // namespace Oru::SoftwareInventoryProfileProvider
