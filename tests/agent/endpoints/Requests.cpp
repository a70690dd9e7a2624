#include "Requests.h"

#include <dlfcn.h>

#include <cstdlib>

namespace {

using tests::FakeCmpi;

template <typename Answer>
Answer& deliveredTo(const CMPIResult* result) {
  return *static_cast<Answer*>(result->hdl);
}

std::string described(const CMPIObjectPath* path) {
  std::string text = FakeCmpi::nameSpaceOf(path) + ":" + FakeCmpi::classOf(path);
  CMPIStatus status{CMPI_RC_OK, nullptr};
  const CMPICount count = path->ft->getKeyCount(path, &status);
  for (CMPICount index = 0; index < count; ++index) {
    CMPIString* name = nullptr;
    const CMPIData value = path->ft->getKeyAt(path, index, &name, &status);
    CMPIData nameData{CMPI_string, CMPI_goodValue, {}};
    nameData.value.string = name;
    text += (index == 0 ? "." : ",") + FakeCmpi::text(nameData) + "=" + FakeCmpi::text(value);
  }
  return text;
}

std::string described(const CMPIData& data) {
  if ((data.type & CMPI_ARRAY) != 0) {
    std::string list;
    for (const CMPIData& element : FakeCmpi::elements(data.value.array)) {
      list += (list.empty() ? "" : ",") + described(element);
    }
    return "{" + list + "}";
  }
  if (data.type == CMPI_uint16) {
    return std::to_string(data.value.uint16);
  }
  return data.type == CMPI_uint64 ? std::to_string(data.value.uint64) + " (uint64)" : FakeCmpi::text(data);
}

}  // namespace

Requests::Requests() {
  setenv("ORU_INVENTORY", INVENTORY_FILE, 1);
  setenv("ORU_LOG", "stderr", 1);
  setenv("ORU_LOG_LEVEL", "4000", 1);
  resultTable.ftVersion = CMPICurrentVersion;
  resultTable.returnInstance = [](const CMPIResult* result, const CMPIInstance* instance) {
    deliveredTo<Answer>(result).instances.push_back(instance);
    return CMPIStatus{CMPI_RC_OK, nullptr};
  };
  resultTable.returnObjectPath = [](const CMPIResult* result, const CMPIObjectPath* path) {
    deliveredTo<Answer>(result).paths.push_back(described(path));
    return CMPIStatus{CMPI_RC_OK, nullptr};
  };
  resultTable.returnDone = [](const CMPIResult* result) {
    ++deliveredTo<Answer>(result).done;
    return CMPIStatus{CMPI_RC_OK, nullptr};
  };
  library_ = dlopen(PROVIDER_LIBRARY, RTLD_NOW | RTLD_LOCAL);
  EXPECT_NE(library_, nullptr) << dlerror();
  using Factory = CMPIInstanceMI* (*)(const CMPIBroker*, const CMPIContext*, CMPIStatus*);
  const auto factory = reinterpret_cast<Factory>(dlsym(library_, "KelvoEndpointProvider_Create_InstanceMI"));
  CMPIStatus status{CMPI_RC_ERR_FAILED, nullptr};
  provider = factory(cmpi.broker(), nullptr, &status);
  EXPECT_EQ(status.rc, CMPI_RC_OK);
}

Requests::~Requests() {
  EXPECT_EQ(provider->ft->cleanup(provider, nullptr, 1).rc, CMPI_RC_OK);
  dlclose(library_);
}

CMPIObjectPath* Requests::path(const char* className, const KeyTexts& keys) {
  CMPIObjectPath* made = cmpi.path("root/cimv2", className);
  for (const auto& [name, value] : keys) {
    cmpi.setKey(made, name, cmpi.stringData(value));
  }
  return made;
}

Requests::Answer Requests::answerOf(const CMPIStatus& status) {
  Answer answer;
  answer.status = status.rc;
  CMPIData message{CMPI_string, CMPI_goodValue, {}};
  message.value.string = status.msg;
  answer.message = status.msg == nullptr ? "(none)" : FakeCmpi::text(message);
  return answer;
}

Requests::Answer Requests::enumerateNames(const CMPIObjectPath* path) {
  Answer delivered;
  const CMPIResult result{&delivered, &resultTable};
  Answer answer = answerOf(provider->ft->enumerateInstanceNames(provider, nullptr, &result, path));
  answer.done = delivered.done;
  answer.paths = std::move(delivered.paths);
  return answer;
}

Requests::Answer Requests::enumerate(const CMPIObjectPath* path, const char** properties) {
  Answer delivered;
  const CMPIResult result{&delivered, &resultTable};
  Answer answer = answerOf(provider->ft->enumerateInstances(provider, nullptr, &result, path, properties));
  answer.done = delivered.done;
  answer.instances = std::move(delivered.instances);
  return answer;
}

Requests::Answer Requests::get(const CMPIObjectPath* path, const char** properties) {
  Answer delivered;
  const CMPIResult result{&delivered, &resultTable};
  Answer answer = answerOf(provider->ft->getInstance(provider, nullptr, &result, path, properties));
  answer.done = delivered.done;
  answer.instances = std::move(delivered.instances);
  return answer;
}

std::string Requests::Answer::property(std::size_t instance, const char* name) const {
  if (instance >= instances.size()) {
    return "(no instance)";
  }
  const std::optional<CMPIData> data = FakeCmpi::property(instances[instance], name);
  return data ? described(*data) : "(unset)";
}

std::vector<std::string> Requests::Answer::propertyNames(std::size_t instance) const {
  std::vector<std::string> names;
  CMPIStatus read{CMPI_RC_OK, nullptr};
  const CMPIInstance* object = instances.at(instance);
  const CMPICount count = object->ft->getPropertyCount(object, &read);
  for (CMPICount index = 0; index < count; ++index) {
    CMPIString* name = nullptr;
    object->ft->getPropertyAt(object, index, &name, &read);
    CMPIData data{CMPI_string, CMPI_goodValue, {}};
    data.value.string = name;
    names.push_back(FakeCmpi::text(data));
  }
  return names;
}
