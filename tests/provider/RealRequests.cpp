#include <dlfcn.h>

#include <cstdlib>
#include <ctime>

#include "RealRequests.h"

namespace {

using tests::FakeCmpi;

CMPIStatus ok() {
  return {CMPI_RC_OK, nullptr};
}

/// A result that hands what it is given to an answer.
template <typename Answer>
class Result {
 public:
  explicit Result(Answer& answer) : handle_{&answer, &table()} {}
  const CMPIResult* handle() const { return &handle_; }

 private:
  static Answer& answerOf(const CMPIResult* result) { return *static_cast<Answer*>(result->hdl); }
  static std::string nameOf(const CMPIObjectPath* path) {
    return FakeCmpi::text(FakeCmpi::key(path, "InstanceID").value());
  }
  static CMPIStatus instance(const CMPIResult* result, const CMPIInstance* instance) {
    answerOf(result).instances.push_back(instance);
    answerOf(result).names.push_back(FakeCmpi::text(FakeCmpi::property(instance, "InstanceID").value()));
    return ok();
  }
  static CMPIStatus path(const CMPIResult* result, const CMPIObjectPath* path) {
    answerOf(result).names.push_back(nameOf(path));
    return ok();
  }
  static CMPIStatus done(const CMPIResult* result) {
    ++answerOf(result).done;
    return ok();
  }
  static CMPIResultFT& table() {
    static CMPIResultFT functions = [] {
      CMPIResultFT made{};
      made.ftVersion = CMPICurrentVersion;
      made.returnInstance = instance;
      made.returnObjectPath = path;
      made.returnDone = done;
      return made;
    }();
    return functions;
  }

  CMPIResult handle_;
};

std::string describe(const CMPIData& data) {
  if (data.type == CMPI_dateTime) {
    return FakeCmpi::text(data.value.dateTime);
  }
  if ((data.type & CMPI_ARRAY) != 0) {
    std::string list;
    for (const CMPIData& element : FakeCmpi::elements(data.value.array)) {
      list += (list.empty() ? "" : ",") + describe(element);
    }
    return list;
  }
  return data.type == CMPI_uint16 ? std::to_string(data.value.uint16) : FakeCmpi::text(data);
}

}  // namespace

RealRequests::RealRequests() {
  setenv("ORU_INVENTORY", INVENTORY_FILE, 1);
  setenv("ORU_LOG", "stderr", 1);
  setenv("TZ", "UTC", 1);
  tzset();
  library_ = dlopen(PROVIDER_LIBRARY, RTLD_NOW | RTLD_LOCAL);
  EXPECT_NE(library_, nullptr) << dlerror();
  using Factory = CMPIInstanceMI* (*)(const CMPIBroker*, const CMPIContext*, CMPIStatus*);
  const auto factory =
      reinterpret_cast<Factory>(dlsym(library_, "SoftwareInventoryProvider_Create_InstanceMI"));
  instances_ = factory(cmpi_.broker(), nullptr, nullptr);
}

RealRequests::~RealRequests() {
  instances_->ft->cleanup(instances_, nullptr, 1);
  dlclose(library_);
}

CMPIObjectPath* RealRequests::path(const char* instanceId) {
  CMPIObjectPath* made = cmpi_.path("root/cimv2", "KELVO_SoftwareIdentity");
  if (instanceId != nullptr) {
    cmpi_.setKey(made, "InstanceID", cmpi_.stringData(instanceId));
  }
  return made;
}

RealRequests::Answer RealRequests::enumerateNames(const char* instanceId) {
  Answer answer;
  const Result<Answer> result(answer);
  answer.status =
      instances_->ft->enumerateInstanceNames(instances_, nullptr, result.handle(), path(instanceId)).rc;
  return answer;
}

RealRequests::Answer RealRequests::enumerate(const char* instanceId) {
  Answer answer;
  const Result<Answer> result(answer);
  answer.status =
      instances_->ft->enumerateInstances(instances_, nullptr, result.handle(), path(instanceId), nullptr).rc;
  return answer;
}

RealRequests::Answer RealRequests::get(const char* instanceId) {
  Answer answer;
  const Result<Answer> result(answer);
  answer.status =
      instances_->ft->getInstance(instances_, nullptr, result.handle(), path(instanceId), nullptr).rc;
  return answer;
}

std::string RealRequests::Answer::property(std::size_t instance, const char* name) const {
  if (instance >= instances.size()) {
    return "(no instance)";
  }
  const std::optional<CMPIData> data = FakeCmpi::property(instances[instance], name);
  return data ? describe(*data) : "(unset)";
}
