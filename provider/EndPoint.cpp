#include "EndPoint.h"

#include <cmpi/cmpimacs.h>

namespace Oru::SoftwareInventoryProfileProvider {

CMPIInstance* nextInstance(const CMPIEnumeration* enumeration) {
  if (enumeration == nullptr) {
    return nullptr;
  }
  CMPIStatus status{CMPI_RC_OK, nullptr};
  const CMPIData next = CMGetNext(enumeration, &status);
  return status.rc == CMPI_RC_OK ? next.value.inst : nullptr;
}

CMPIObjectPath* pathOfInstance(const CMPIInstance* instance) {
  if (instance == nullptr) {
    return nullptr;
  }
  CMPIStatus status{CMPI_RC_OK, nullptr};
  CMPIObjectPath* path = CMGetObjectPath(instance, &status);
  return status.rc == CMPI_RC_OK ? path : nullptr;
}

}  // namespace Oru::SoftwareInventoryProfileProvider
