#include "SoftwareInventoryProvider.h"

#include <Oru/ProviderUtilities.h>
#include <Trace.h>
#include <cmpi/cmpimacs.h>

#include <atomic>
#include <exception>

#include "CMPISoftwareIdentity.h"

namespace Oru::SoftwareInventoryProfileProvider {

const CMPIBroker* broker = nullptr;

namespace {

const std::string loggerSoftwareInventoryProvider(traceCategory);

/// Class ids that the front end dispatches on.
enum ClassId : std::uint16_t {
  SoftwareIdentityClass = 2,
  SecondSoftwareIdentityClass = 10,
  InstalledSoftwareIdentityClass = 3,
  RefusedClass = 11,
  NetworkSoftwareIdentityClass = 35,
  BMCSoftwareIdentityClass = 117,
  BIOSSoftwareIdentityClass = 118,
  UnknownClass = 255,
};

// Object managers may call a factory again while requests run.
void storeBroker(const CMPIBroker* newBroker) {
  std::atomic_ref(broker).store(newBroker, std::memory_order_relaxed);
}
const CMPIBroker* currentBroker() {
  return std::atomic_ref(broker).load(std::memory_order_relaxed);
}

CMPIStatus statusOf(CMPIrc code) {
  return {code, nullptr};
}

/// The frame of every function that does real work: banner, class id, dispatch, exceptions to the log. An
/// exception ends the dispatch and leaves the status as it was; what was delivered stays delivered.
template <typename Dispatch>
CMPIStatus answer(const CMPIObjectPath* path, Dispatch dispatch, CallSite site = CallSite::here()) {
  beginRequest();
  markProviderEntry(loggerSoftwareInventoryProvider, site.function, site.file, site.line);
  const unsigned short classId = ProviderUtilities::getClassId(path);
  traceVariable({loggerSoftwareInventoryProvider, site}, "classId", classId);
  CMPIStatus status = statusOf(CMPI_RC_OK);
  try {
    dispatch(classId, status);
  } catch (const std::exception& exception) {
    traceException({loggerSoftwareInventoryProvider, site}, exception);
  }
  markProviderExit(loggerSoftwareInventoryProvider, site.function, site.file, site.line);
  return status;
}

/// Delivers each object of an adapter that is built from the request's path, then the done marker.
template <typename Adapter, typename Deliver>
void walk(const CMPIContext* context, const CMPIResult* result, const CMPIObjectPath* path, Deliver deliver) {
  Adapter adapter(currentBroker(), context, path);
  while (adapter) {
    deliver(adapter);
    ++adapter;
  }
  CMReturnDone(result);
}

/// All that a function does which touches neither its arguments nor the result: it says that it was invoked.
CMPIStatus answerAtOnce(CMPIrc code, CallSite site = CallSite::here()) {
  beginRequest();
  traceMethod({loggerSoftwareInventoryProvider, site});
  return statusOf(code);
}

}  // namespace

bool getClassId(const char* className, const char* nameSpace, std::vector<std::uint16_t>& ids) {
  const TraceScope scope(loggerSoftwareInventoryProvider);
  const unsigned short id = ProviderUtilities::getClassId(className);
  if (id != UnknownClass) {
    ids.push_back(id);
    return true;
  }
  const std::string nameSpaceText(nameSpace != nullptr ? nameSpace : "");
  const std::size_t before = ids.size();
  if (ProviderUtilities::areClassesRelated(currentBroker(), nameSpaceText, className,
                                           "CIM_InstalledSoftwareIdentity")) {
    ids.push_back(InstalledSoftwareIdentityClass);
  }
  if (ProviderUtilities::areClassesRelated(currentBroker(), nameSpaceText, className,
                                           "CIM_ElementSoftwareIdentity")) {
    ids.insert(ids.end(),
               {NetworkSoftwareIdentityClass, BMCSoftwareIdentityClass, BIOSSoftwareIdentityClass});
  }
  return ids.size() > before;
}

// ---- The instance interface.

CMPIStatus SoftwareInventory_Cleanup(CMPIInstanceMI*, const CMPIContext*, CMPIBoolean) {
  return answerAtOnce(CMPI_RC_OK);
}

CMPIStatus SoftwareInventory_EnumInstanceNames(CMPIInstanceMI*, const CMPIContext* context,
                                               const CMPIResult* result, const CMPIObjectPath* classPath) {
  return answer(classPath, [&](unsigned short classId, CMPIStatus& status) {
    switch (classId) {
      case SoftwareIdentityClass:
      case SecondSoftwareIdentityClass:
        walk<CMPISoftwareIdentity>(context, result, classPath, [&](CMPISoftwareIdentity& adapter) {
          if (const CMPIObjectPath* path = adapter.getObjectPath()) {
            CMReturnObjectPath(result, path);
          }
        });
        break;
      default:
        status.rc = CMPI_RC_ERR_INVALID_CLASS;
    }
  });
}

CMPIStatus SoftwareInventory_EnumInstances(CMPIInstanceMI*, const CMPIContext* context,
                                           const CMPIResult* result, const CMPIObjectPath* classPath,
                                           const char** properties) {
  return answer(classPath, [&](unsigned short classId, CMPIStatus& status) {
    switch (classId) {
      case SoftwareIdentityClass:
      case SecondSoftwareIdentityClass:
        walk<CMPISoftwareIdentity>(context, result, classPath, [&](CMPISoftwareIdentity& adapter) {
          if (const CMPIInstance* instance = adapter.getCMPIInstance(properties)) {
            CMReturnInstance(result, instance);
          }
        });
        break;
      default:
        status.rc = CMPI_RC_ERR_INVALID_CLASS;
    }
  });
}

// It delivers whatever the keys select and counts nothing: none is OK, too.
CMPIStatus SoftwareInventory_GetInstance(CMPIInstanceMI*, const CMPIContext* context,
                                         const CMPIResult* result, const CMPIObjectPath* instancePath,
                                         const char** properties) {
  return answer(instancePath, [&](unsigned short classId, CMPIStatus& status) {
    switch (classId) {
      case SoftwareIdentityClass:
      case SecondSoftwareIdentityClass:
        walk<CMPISoftwareIdentity>(context, result, instancePath, [&](CMPISoftwareIdentity& adapter) {
          CMReturnInstance(result, adapter.getCMPIInstance(properties));
        });
        break;
      case RefusedClass:
        status.rc = CMPI_RC_ERR_NOT_SUPPORTED;
        break;
      default:
        status.rc = CMPI_RC_ERR_INVALID_CLASS;
    }
  });
}

CMPIStatus SoftwareInventory_CreateInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*,
                                            const CMPIObjectPath*, const CMPIInstance*) {
  return answerAtOnce(CMPI_RC_ERR_NOT_SUPPORTED);
}

// Changes nothing and reports success: the broker's answer to the class name question becomes the status.
CMPIStatus SoftwareInventory_ModifyInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*,
                                            const CMPIObjectPath* instancePath, const CMPIInstance* instance,
                                            const char**) {
  beginRequest();
  CMPIStatus status = statusOf(CMPI_RC_ERR_NOT_SUPPORTED);
  if (instance == nullptr || instance->hdl == nullptr) {
    status.rc = CMPI_RC_ERR_FAILED;
  } else if (instancePath != nullptr) {
    ProviderUtilities::getClassId(instancePath);
    CMGetClassName(instancePath, &status);
    if (const CMPIString* className = CMGetClassName(instancePath, &status)) {
      CMGetCharsPtr(className, nullptr);
    }
  }
  traceMethod(loggerSoftwareInventoryProvider);
  return statusOf(status.rc);
}

CMPIStatus SoftwareInventory_DeleteInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*,
                                            const CMPIObjectPath*) {
  return answerAtOnce(CMPI_RC_ERR_NOT_SUPPORTED);
}

CMPIStatus SoftwareInventory_ExecQuery(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*,
                                       const CMPIObjectPath*, const char*, const char*) {
  return answerAtOnce(CMPI_RC_ERR_NOT_SUPPORTED);
}

// ---- The association interface.

CMPIStatus SoftwareInventory_AssociationCleanup(CMPIAssociationMI*, const CMPIContext*, CMPIBoolean) {
  return answerAtOnce(CMPI_RC_OK);
}

CMPIStatus SoftwareInventory_Associators(CMPIAssociationMI*, const CMPIContext*, const CMPIResult*,
                                         const CMPIObjectPath*, const char*, const char*, const char*,
                                         const char*, const char**) {
  return answerAtOnce(CMPI_RC_ERR_NOT_SUPPORTED);
}

CMPIStatus SoftwareInventory_AssociatorNames(CMPIAssociationMI*, const CMPIContext*, const CMPIResult*,
                                             const CMPIObjectPath*, const char*, const char*, const char*,
                                             const char*) {
  return answerAtOnce(CMPI_RC_ERR_NOT_SUPPORTED);
}

CMPIStatus SoftwareInventory_References(CMPIAssociationMI*, const CMPIContext*, const CMPIResult*,
                                        const CMPIObjectPath*, const char*, const char*, const char**) {
  return answerAtOnce(CMPI_RC_ERR_NOT_SUPPORTED);
}

CMPIStatus SoftwareInventory_ReferenceNames(CMPIAssociationMI*, const CMPIContext*, const CMPIResult*,
                                            const CMPIObjectPath*, const char*, const char*) {
  return answerAtOnce(CMPI_RC_ERR_NOT_SUPPORTED);
}

namespace {

CMPIInstanceMIFT instMIFT__ = {
    CMPICurrentVersion,
    CMPICurrentVersion,
    "instanceSoftwareInventoryProvider",
    SoftwareInventory_Cleanup,
    SoftwareInventory_EnumInstanceNames,
    SoftwareInventory_EnumInstances,
    SoftwareInventory_GetInstance,
    SoftwareInventory_CreateInstance,
    SoftwareInventory_ModifyInstance,
    SoftwareInventory_DeleteInstance,
    SoftwareInventory_ExecQuery,
};

CMPIAssociationMIFT assocMIFT__ = {
    CMPICurrentVersion,
    CMPICurrentVersion,
    "associationSoftwareInventoryProvider",
    SoftwareInventory_AssociationCleanup,
    SoftwareInventory_Associators,
    SoftwareInventory_AssociatorNames,
    SoftwareInventory_References,
    SoftwareInventory_ReferenceNames,
};

}  // namespace

}  // namespace Oru::SoftwareInventoryProfileProvider

namespace provider = Oru::SoftwareInventoryProfileProvider;

CMPIInstanceMI* SoftwareInventoryProvider_Create_InstanceMI(const CMPIBroker* broker, const CMPIContext*,
                                                            CMPIStatus*) {
  static CMPIInstanceMI mi = {nullptr, &provider::instMIFT__};
  provider::storeBroker(broker);
  return &mi;
}

CMPIAssociationMI* SoftwareInventoryProvider_Create_AssociationMI(const CMPIBroker* broker,
                                                                  const CMPIContext*, CMPIStatus*) {
  static CMPIAssociationMI mi = {nullptr, &provider::assocMIFT__};
  provider::storeBroker(broker);
  return &mi;
}
