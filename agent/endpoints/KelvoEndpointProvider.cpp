// The instance provider of the elements that associations end on: its function table and factory.
//
// It asks the framework alone, never the object manager (no upcall), so the software inventory's provider may
// ask for its elements in the middle of a request. Threads: requests share nothing but the broker.
#include <agent/endpoints/Delivery.h>
#include <agent/endpoints/RequestPath.h>

#include <Oru/ProviderUtilities.h>
#include <ZelLog/ZelLogger.h>
#include <cmpi/cmpimacs.h>

#include <exception>
#include <memory>
#include <string>

namespace agent::endpoints {
namespace {

using Oru::ProviderUtilities;

constexpr int errorLevel = 3000;
constexpr int routineLevel = 4000;

/// What a factory gave out. One for each call of the factory, so that several object managers of a process
/// have their own broker each.
struct Provider {
  CMPIInstanceMI interface;
  const CMPIBroker* broker;
};

const CMPIBroker* brokerOf(const CMPIInstanceMI* mi) {
  return static_cast<const Provider*>(mi->hdl)->broker;
}

void log(int level, const std::string& message, const char* function = __builtin_FUNCTION(),
         unsigned int line = __builtin_LINE()) {
  static const std::string category = "Kelvo.EndpointProvider";
  ZelLog::ZelLogger::logLevelMessage(function, __FILE__, line, category, level, nullptr, 0, 0, message);
  ZelLog::ZelLogger::traceLevelMessage(function, __FILE__, line, category, level, nullptr, 0, 0, message);
}

CMPIStatus failed(const CMPIInstanceMI* mi, CMPIrc code, const std::string& message) {
  return {code, CMNewString(brokerOf(mi), message.c_str(), nullptr)};
}

/// The frame of every request: what it throws becomes its status.
template <typename Request>
CMPIStatus answer(const CMPIInstanceMI* mi, Request request) {
  try {
    request();
    return {CMPI_RC_OK, nullptr};
  } catch (const Failure& failure) {
    if (failure.code() != CMPI_RC_ERR_NOT_FOUND) {
      log(errorLevel, failure.what());
    }
    return failed(mi, failure.code(), failure.what());
  } catch (const std::exception& exception) {
    log(errorLevel, exception.what());
    return failed(mi, CMPI_RC_ERR_FAILED, exception.what());
  }
}

const Kind& kindOfRequest(const CMPIObjectPath* path) {
  if (const Kind* kind = kindOf(ProviderUtilities::getClassId(path))) {
    return *kind;
  }
  throw Failure(CMPI_RC_ERR_INVALID_CLASS,
                "the endpoint provider serves no other classes than " + classNames());
}

void logWhatIsLeftOut(const Kind& kind, const Endpoints& all) {
  if (all.withoutKeys() > 0) {
    log(errorLevel, std::to_string(all.withoutKeys()) + " of the nodes of " + kind.className +
                        " have no name, or stand below no computer with a name, and are left out");
  }
  if (all.repeated() > 0) {
    log(routineLevel, std::to_string(all.repeated()) + " of the nodes of " + kind.className +
                          " have the keys of one before and are left out");
  }
}

/// Hands every element that the path's keys let pass to `deliver`. Keys save no walking: a path with the
/// DeviceID alone is a scan of all ports.
template <typename Deliver>
void enumerate(const CMPIInstanceMI* mi, const CMPIResult* result, const CMPIObjectPath* path,
               Deliver deliver) {
  const Kind& kind = kindOfRequest(path);
  const RequestPath wanted(path, kind);
  Delivery delivery(brokerOf(mi), result, wanted.nameSpace(), kind.className);
  Endpoints endpoints(kind, [&](const Keys& keys) { return wanted.passes(keys); });
  for (; endpoints; ++endpoints) {
    deliver(delivery, endpoints);
  }
  delivery.done();
  logWhatIsLeftOut(kind, endpoints);
}

CMPIStatus enumerateInstanceNames(CMPIInstanceMI* mi, const CMPIContext* /*context*/,
                                  const CMPIResult* result, const CMPIObjectPath* path) {
  return answer(mi, [&] {
    enumerate(mi, result, path,
              [](Delivery& delivery, const Endpoints& endpoints) { delivery.path(endpoints.keys()); });
  });
}

CMPIStatus enumerateInstances(CMPIInstanceMI* mi, const CMPIContext* /*context*/, const CMPIResult* result,
                              const CMPIObjectPath* path, const char** properties) {
  return answer(mi, [&] {
    enumerate(mi, result, path, [&](Delivery& delivery, Endpoints& endpoints) {
      delivery.instance(endpoints.keys(), endpoints.properties(), properties);
    });
  });
}

CMPIStatus getInstance(CMPIInstanceMI* mi, const CMPIContext* /*context*/, const CMPIResult* result,
                       const CMPIObjectPath* path, const char** properties) {
  return answer(mi, [&] {
    const Kind& kind = kindOfRequest(path);
    const RequestPath wanted(path, kind);
    if (const char* missing = wanted.missingKey()) {
      throw Failure(CMPI_RC_ERR_INVALID_PARAMETER,
                    std::string("the path names no one ") + kind.className + ": it lacks the key " + missing);
    }
    Endpoints endpoints(kind, [&](const Keys& keys) { return wanted.passes(keys); });
    if (!endpoints) {
      throw Failure(CMPI_RC_ERR_NOT_FOUND,
                    std::string("there is no ") + kind.className + "." + wanted.text());
    }
    Delivery delivery(brokerOf(mi), result, wanted.nameSpace(), kind.className);
    delivery.instance(endpoints.keys(), endpoints.properties(), properties);
    delivery.done();
  });
}

// ---- What the machine's elements do not take.

CMPIStatus notSupported(const CMPIInstanceMI* mi, const char* operation) {
  return failed(
      mi, CMPI_RC_ERR_NOT_SUPPORTED,
      std::string(operation) + ": computers, management controllers and network ports can be read alone");
}

CMPIStatus createInstance(CMPIInstanceMI* mi, const CMPIContext* /*context*/, const CMPIResult* /*result*/,
                          const CMPIObjectPath* /*path*/, const CMPIInstance* /*instance*/) {
  return notSupported(mi, "CreateInstance");
}

CMPIStatus modifyInstance(CMPIInstanceMI* mi, const CMPIContext* /*context*/, const CMPIResult* /*result*/,
                          const CMPIObjectPath* /*path*/, const CMPIInstance* /*instance*/,
                          const char** /*properties*/) {
  return notSupported(mi, "ModifyInstance");
}

CMPIStatus deleteInstance(CMPIInstanceMI* mi, const CMPIContext* /*context*/, const CMPIResult* /*result*/,
                          const CMPIObjectPath* /*path*/) {
  return notSupported(mi, "DeleteInstance");
}

CMPIStatus execQuery(CMPIInstanceMI* mi, const CMPIContext* /*context*/, const CMPIResult* /*result*/,
                     const CMPIObjectPath* /*path*/, const char* /*query*/, const char* /*language*/) {
  return notSupported(mi, "ExecQuery");
}

/// The last call: the interface is gone after it.
CMPIStatus cleanup(CMPIInstanceMI* mi, const CMPIContext* /*context*/, CMPIBoolean /*terminating*/) {
  const std::unique_ptr<const Provider> owned(static_cast<const Provider*>(mi->hdl));
  return {CMPI_RC_OK, nullptr};
}

CMPIInstanceMIFT functions = {
    CMPICurrentVersion,
    CMPICurrentVersion,
    "instanceKelvoEndpointProvider",
    cleanup,
    enumerateInstanceNames,
    enumerateInstances,
    getInstance,
    createInstance,
    modifyInstance,
    deleteInstance,
    execQuery,
};

}  // namespace
}  // namespace agent::endpoints

/// The factory, by the name that object managers look up. The interface lives until its `cleanup`.
extern "C" [[gnu::visibility("default")]] CMPIInstanceMI* KelvoEndpointProvider_Create_InstanceMI(
    const CMPIBroker* broker, const CMPIContext* /*context*/, CMPIStatus* status) {
  using namespace agent::endpoints;  // NOLINT(google-build-using-namespace)
  auto provider = std::make_unique<Provider>();
  provider->interface = {provider.get(), &functions};
  provider->broker = broker;
  if (status != nullptr) {
    *status = {CMPI_RC_OK, nullptr};
  }
  return &provider.release()->interface;
}
