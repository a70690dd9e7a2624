#include "SoftwareInventoryProvider.h"

#include <Oru/ProviderUtilities.h>
#include <Trace.h>
#include <cmpi/cmpimacs.h>

#include <exception>

#include "Answers.h"
#include "CMPIBIOSSoftwareIdentity.h"
#include "CMPIBMCSoftwareIdentity.h"
#include "CMPIInstalledSoftwareIdentity.h"
#include "CMPINetworkSoftwareIdentity.h"
#include "CMPISoftwareIdentity.h"

namespace Oru::SoftwareInventoryProfileProvider {

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

/// Shows each position of an adapter that is built from the request's path.
template <typename Adapter, typename Visit>
void walk(const CMPIContext* context, const CMPIObjectPath* path, const Visit& visit) {
  Adapter adapter(currentBroker(), context, path);
  while (adapter) {
    visit(adapter);
    ++adapter;
  }
}

/// The same for the adapter of an association class. False for any other class.
template <typename Visit>
bool walkAssociation(unsigned short classId, const CMPIContext* context, const CMPIObjectPath* path,
                     const Visit& visit) {
  switch (classId) {
    case InstalledSoftwareIdentityClass:
      walk<CMPIInstalledSoftwareIdentity>(context, path, visit);
      return true;
    case NetworkSoftwareIdentityClass:
      walk<CMPINetworkSoftwareIdentity>(context, path, visit);
      return true;
    case BMCSoftwareIdentityClass:
      walk<CMPIBMCSoftwareIdentity>(context, path, visit);
      return true;
    case BIOSSoftwareIdentityClass:
      walk<CMPIBIOSSoftwareIdentity>(context, path, visit);
      return true;
    default:
      return false;
  }
}

/// As above, for one of several association classes: an exception ends this walk and not the request.
template <typename Visit>
bool associate(unsigned short classId, const CMPIContext* context, const CMPIObjectPath* source,
               const Visit& visit, CallSite site = CallSite::here()) {
  try {
    return walkAssociation(classId, context, source, visit);
  } catch (const std::exception& exception) {
    traceException({loggerSoftwareInventoryProvider, site}, exception);
    return true;
  }
}

/// The names of all software. What a name takes is put in the place of its calls: the calls are a good part
/// of it.
[[gnu::flatten]] void nameSoftware(const CMPIContext* context, const CMPIResult* result,
                                   const CMPIObjectPath* classPath) {
  walk<CMPISoftwareIdentity>(context, classPath, [result](CMPISoftwareIdentity& adapter) {
    if (const CMPIObjectPath* path = adapter.getObjectPath()) {
      CMReturnObjectPath(result, path);
    }
  });
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
    if (classId == SoftwareIdentityClass || classId == SecondSoftwareIdentityClass) {
      nameSoftware(context, result, classPath);
    } else if (!walkAssociation(classId, context, classPath,
                                [&](auto& adapter) { deliver(result, adapter.getObjectPath()); })) {
      status.rc = CMPI_RC_ERR_INVALID_CLASS;
      return;
    }
    CMReturnDone(result);
  });
}

CMPIStatus SoftwareInventory_EnumInstances(CMPIInstanceMI*, const CMPIContext* context,
                                           const CMPIResult* result, const CMPIObjectPath* classPath,
                                           const char** properties) {
  return answer(classPath, [&](unsigned short classId, CMPIStatus& status) {
    if (classId == SoftwareIdentityClass || classId == SecondSoftwareIdentityClass) {
      walk<CMPISoftwareIdentity>(context, classPath, [&](CMPISoftwareIdentity& adapter) {
        if (const CMPIInstance* instance = adapter.getCMPIInstance(properties)) {
          CMReturnInstance(result, instance);
        }
      });
    } else if (!walkAssociation(classId, context, classPath, [&](auto& adapter) {
                 deliver(result, adapter.getCMPIInstance(properties));
               })) {
      status.rc = CMPI_RC_ERR_INVALID_CLASS;
      return;
    }
    CMReturnDone(result);
  });
}

// It delivers whatever the keys select and counts nothing: none is OK, too. Of the associations, those of
// installed software alone can be fetched singly.
CMPIStatus SoftwareInventory_GetInstance(CMPIInstanceMI*, const CMPIContext* context,
                                         const CMPIResult* result, const CMPIObjectPath* instancePath,
                                         const char** properties) {
  return answer(instancePath, [&](unsigned short classId, CMPIStatus& status) {
    const auto deliverInstance = [&](auto& adapter) { deliver(result, adapter.getCMPIInstance(properties)); };
    switch (classId) {
      case SoftwareIdentityClass:
      case SecondSoftwareIdentityClass:
        walk<CMPISoftwareIdentity>(context, instancePath, deliverInstance);
        break;
      case InstalledSoftwareIdentityClass:
        walk<CMPIInstalledSoftwareIdentity>(context, instancePath, deliverInstance);
        break;
      case NetworkSoftwareIdentityClass:
      case BMCSoftwareIdentityClass:
      case BIOSSoftwareIdentityClass:
      case RefusedClass:
        status.rc = CMPI_RC_ERR_NOT_SUPPORTED;
        return;
      default:
        status.rc = CMPI_RC_ERR_INVALID_CLASS;
        return;
    }
    CMReturnDone(result);
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

namespace {

/// Entry, the parameters that are worth a trace, and the class ids that the association class stands for. A
/// class that stands for none is the status, and the answer is empty.
std::vector<std::uint16_t> beginAssociation(const CMPIObjectPath* source, const char* associationClass,
                                            const char* resultClass, CMPIStatus& status, CallSite site) {
  const LogPoint point(loggerSoftwareInventoryProvider, site);
  beginRequest();
  markProviderEntry(loggerSoftwareInventoryProvider, site.function, site.file, site.line);
  traceVariable(point, "resultClass", resultClass);
  traceVariable(point, "associationClass", associationClass);
  const std::string nameSpace = ProviderUtilities::getNamespace(source);
  std::vector<std::uint16_t> ids;
  if (!getClassId(associationClass, nameSpace.c_str(), ids)) {
    traceVariable(point, "CMPI_RC_ERR_INVALID_CLASS", CMPI_RC_ERR_INVALID_CLASS);
    status.rc = CMPI_RC_ERR_INVALID_CLASS;
  }
  return ids;
}

CMPIStatus endAssociation(CMPIStatus status, CallSite site) {
  markProviderExit(loggerSoftwareInventoryProvider, site.function, site.file, site.line);
  return status;
}

}  // namespace

// Result class and roles narrow nothing here: each association class has one class at its far end. An id
// without an adapter ends the request at once, without the done marker.
CMPIStatus SoftwareInventory_Associators(CMPIAssociationMI*, const CMPIContext* context,
                                         const CMPIResult* result, const CMPIObjectPath* sourcePath,
                                         const char* assocClass, const char* resultClass, const char*,
                                         const char*, const char** properties) {
  const CallSite site = CallSite::here();
  CMPIStatus status = statusOf(CMPI_RC_OK);
  for (const std::uint16_t id : beginAssociation(sourcePath, assocClass, resultClass, status, site)) {
    if (!associate(id, context, sourcePath,
                   [&](auto& adapter) { deliver(result, adapter.getAssociator(properties)); })) {
      status.rc = CMPI_RC_ERR_INVALID_CLASS;
      return endAssociation(status, site);
    }
  }
  CMReturnDone(result);
  return endAssociation(status, site);
}

CMPIStatus SoftwareInventory_AssociatorNames(CMPIAssociationMI*, const CMPIContext* context,
                                             const CMPIResult* result, const CMPIObjectPath* sourcePath,
                                             const char* assocClass, const char* resultClass, const char*,
                                             const char*) {
  const CallSite site = CallSite::here();
  CMPIStatus status = statusOf(CMPI_RC_OK);
  for (const std::uint16_t id : beginAssociation(sourcePath, assocClass, resultClass, status, site)) {
    const bool rcode = associate(id, context, sourcePath,
                                 [&](auto& adapter) { deliver(result, adapter.getAssociatorNames()); });
    traceVariable(loggerSoftwareInventoryProvider, "rcode", rcode);
    if (!rcode) {
      status.rc = CMPI_RC_ERR_INVALID_CLASS;
      // Said again as the reason to leave.
      traceVariable(loggerSoftwareInventoryProvider, "rcode", rcode);
      return endAssociation(status, site);
    }
  }
  CMReturnDone(result);
  return endAssociation(status, site);
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
