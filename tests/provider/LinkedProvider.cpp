#include <SoftwareInventoryProvider.h>

#include "ProviderAccess.h"

const ProviderAccess& providerAccess() {
  static const ProviderAccess access{SoftwareInventoryProvider_Create_InstanceMI,
                                     SoftwareInventoryProvider_Create_AssociationMI, &standin::world()};
  return access;
}
