#include "RealAssociations.h"

#include <dlfcn.h>

#include <cstdlib>

namespace {

using tests::FakeCmpi;

CMPIStatus ok() {
  return {CMPI_RC_OK, nullptr};
}

std::string describe(const CMPIObjectPath* path);

std::string describe(const CMPIData& data) {
  return data.type == CMPI_ref ? describe(data.value.ref) : FakeCmpi::text(data);
}

/// The keys that tell objects of a class apart, by the names that the classes here have.
std::string describe(const CMPIObjectPath* path) {
  if (path == nullptr) {
    return "(null)";
  }
  std::string values;
  for (const char* key :
       {"Name", "DeviceID", "InstanceID", "System", "InstalledSoftware", "Antecedent", "Dependent"}) {
    if (const auto data = FakeCmpi::key(path, key)) {
      values += (values.empty() ? "" : ",") + describe(*data);
    }
  }
  return FakeCmpi::classOf(path) + "(" + values + ")";
}

/// A result that hands what it is given to an object with the members `path`, `instance` and `done`.
template <typename Taker>
class Result {
 public:
  explicit Result(Taker& taker) : handle_{&taker, &table()} {}
  const CMPIResult* handle() const { return &handle_; }

 private:
  static Taker& takerOf(const CMPIResult* result) { return *static_cast<Taker*>(result->hdl); }
  static CMPIResultFT& table() {
    static CMPIResultFT functions = [] {
      CMPIResultFT made{};
      made.ftVersion = CMPICurrentVersion;
      made.returnInstance = [](const CMPIResult* result, const CMPIInstance* instance) {
        takerOf(result).instance(instance);
        return ok();
      };
      made.returnObjectPath = [](const CMPIResult* result, const CMPIObjectPath* path) {
        takerOf(result).path(path);
        return ok();
      };
      made.returnDone = [](const CMPIResult* result) {
        takerOf(result).done();
        return ok();
      };
      return made;
    }();
    return functions;
  }

  CMPIResult handle_;
};

/// Takes the objects of one answer.
template <typename Answer>
struct Taker {
  Answer& answer;

  void path(const CMPIObjectPath* path) const {
    answer.paths.push_back(path);
    answer.objects.push_back(describe(path));
  }
  void instance(const CMPIInstance* instance) const {
    const CMPIObjectPath* path =
        instance != nullptr ? instance->ft->getObjectPath(instance, nullptr) : nullptr;
    answer.objects.push_back(describe(path));
  }
  void done() const { ++answer.done; }
};

/// Collects the instances that an upcall asks for.
struct Collector {
  std::vector<CMPIInstance*>& instances;

  void path(const CMPIObjectPath*) const { ADD_FAILURE() << "a path among instances"; }
  void instance(const CMPIInstance* instance) const {
    instances.push_back(const_cast<CMPIInstance*>(instance));
  }
  void done() const {}
};

template <typename Answer, typename Ask>
Answer answerOf(Ask ask) {
  Answer answer;
  Taker<Answer> taker{answer};
  const Result<Taker<Answer>> result(taker);
  answer.status = ask(result.handle()).rc;
  return answer;
}

template <typename Interface>
Interface* interfaceOf(void* library, const char* factoryName, const CMPIBroker* broker) {
  EXPECT_NE(library, nullptr) << dlerror();
  using Factory = Interface* (*)(const CMPIBroker*, const CMPIContext*, CMPIStatus*);
  const auto factory = reinterpret_cast<Factory>(dlsym(library, factoryName));
  CMPIStatus status = ok();
  return factory(broker, nullptr, &status);
}

}  // namespace

RealAssociations::RealAssociations() {
  setenv("ORU_INVENTORY", INVENTORY_FILE, 1);
  setenv("ORU_LOG", "stderr", 1);
  library_ = dlopen(PROVIDER_LIBRARY, RTLD_NOW | RTLD_LOCAL);
  endpointLibrary_ = dlopen(ENDPOINT_LIBRARY, RTLD_NOW | RTLD_LOCAL);
  const CMPIBroker* const broker = cmpi_.broker();
  instances_ = interfaceOf<CMPIInstanceMI>(library_, "SoftwareInventoryProvider_Create_InstanceMI", broker);
  associations_ =
      interfaceOf<CMPIAssociationMI>(library_, "SoftwareInventoryProvider_Create_AssociationMI", broker);
  endpoints_ =
      interfaceOf<CMPIInstanceMI>(endpointLibrary_, "KelvoEndpointProvider_Create_InstanceMI", broker);
  cmpi_.source = [this](const CMPIObjectPath* asked, std::vector<CMPIInstance*>& found) {
    return askEndpoints(asked, found);
  };
}

RealAssociations::~RealAssociations() {
  instances_->ft->cleanup(instances_, nullptr, 1);
  associations_->ft->cleanup(associations_, nullptr, 1);
  endpoints_->ft->cleanup(endpoints_, nullptr, 1);
  dlclose(endpointLibrary_);
  dlclose(library_);
}

CMPIrc RealAssociations::askEndpoints(const CMPIObjectPath* path, std::vector<CMPIInstance*>& instances) {
  Collector collector{instances};
  const Result<Collector> result(collector);
  return endpoints_->ft->enumerateInstances(endpoints_, nullptr, result.handle(), path, nullptr).rc;
}

RealAssociations::Answer RealAssociations::names(const CMPIObjectPath* source, const char* associationClass) {
  return answerOf<Answer>([&](const CMPIResult* result) {
    return associations_->ft->associatorNames(associations_, nullptr, result, source, associationClass,
                                              nullptr, nullptr, nullptr);
  });
}

RealAssociations::Answer RealAssociations::associators(const CMPIObjectPath* source,
                                                       const char* associationClass) {
  return answerOf<Answer>([&](const CMPIResult* result) {
    return associations_->ft->associators(associations_, nullptr, result, source, associationClass, nullptr,
                                          nullptr, nullptr, nullptr);
  });
}

RealAssociations::Answer RealAssociations::enumerateNames(const char* className) {
  return answerOf<Answer>([&](const CMPIResult* result) {
    return instances_->ft->enumerateInstanceNames(instances_, nullptr, result, path(className));
  });
}

RealAssociations::Answer RealAssociations::enumerate(const char* className) {
  return answerOf<Answer>([&](const CMPIResult* result) {
    return instances_->ft->enumerateInstances(instances_, nullptr, result, path(className), nullptr);
  });
}

RealAssociations::Answer RealAssociations::get(const CMPIObjectPath* path) {
  return answerOf<Answer>([&](const CMPIResult* result) {
    return instances_->ft->getInstance(instances_, nullptr, result, path, nullptr);
  });
}

CMPIObjectPath* RealAssociations::path(const char* className, const Keys& keys) {
  CMPIObjectPath* made = cmpi_.path("root/cimv2", className);
  for (const auto& [name, value] : keys) {
    cmpi_.setKey(made, name, cmpi_.stringData(value));
  }
  return made;
}

CMPIObjectPath* RealAssociations::software(const char* instanceId) {
  return path("KELVO_SoftwareIdentity", {{"InstanceID", instanceId}});
}
CMPIObjectPath* RealAssociations::computer(const char* name) {
  return path("KELVO_ComputerSystem", {{"CreationClassName", "KELVO_ComputerSystem"}, {"Name", name}});
}
CMPIObjectPath* RealAssociations::port(const char* deviceId) {
  return path("KELVO_NetworkPort", {{"CreationClassName", "KELVO_NetworkPort"}, {"DeviceID", deviceId}});
}
