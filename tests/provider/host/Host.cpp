#include "Host.h"

#include <cimom/ProviderRegistration.h>
#include <dlfcn.h>
#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <set>
#include <stdexcept>

namespace host {
namespace {

using tests::HostileCmpi;

CMPIStatus ok() {
  return {CMPI_RC_OK, nullptr};
}

std::string described(const CMPIData& data);

std::string described(const CMPIObjectPath* path) {
  static const std::set<std::string> telling{
      "Name", "DeviceID", "InstanceID", "System", "InstalledSoftware", "Antecedent", "Dependent"};
  std::string values;
  for (const auto& [name, value] : HostileCmpi::keysOf(path)) {
    if (telling.contains(name)) {
      values += (values.empty() ? "" : ",") + described(value);
    }
  }
  return HostileCmpi::classOf(path) + "(" + values + ")";
}

std::string described(const CMPIArray* array) {
  std::string list;
  for (const CMPIData& element : HostileCmpi::elements(array)) {
    list += (list.empty() ? "" : ",") + described(element);
  }
  return "{" + list + "}";
}

std::string described(const CMPIData& data) {
  if (data.state != CMPI_goodValue) {
    return "(null)";
  }
  if ((data.type & CMPI_ARRAY) != 0) {
    return described(data.value.array);
  }
  switch (data.type) {
    case CMPI_string:
      return HostileCmpi::text(data);
    case CMPI_dateTime:
      return HostileCmpi::text(data.value.dateTime);
    case CMPI_ref:
      return described(data.value.ref);
    case CMPI_uint16:
      return std::to_string(data.value.uint16);
    case CMPI_uint64:
      return std::to_string(data.value.uint64);
    default:
      return "(of type " + std::to_string(data.type) + ")";
  }
}

Object objectOf(const CMPIObjectPath* path) {
  Object object{described(path), {}, {}};
  for (const auto& [name, value] : HostileCmpi::keysOf(path)) {
    object.keys[name] = described(value);
  }
  return object;
}

Object objectOf(const CMPIInstance* instance) {
  Object object = objectOf(HostileCmpi::pathOf(instance));
  for (const auto& [name, value] : HostileCmpi::propertiesOf(instance)) {
    object.properties[name] = described(value);
  }
  return object;
}

/// A result that hands what it is given to an object with the members `path`, `instance` and `done`, and
/// answers a null with a status.
template <typename Taker>
class Result {
 public:
  explicit Result(Taker& taker) : handle_{&taker, &table()} {}
  [[nodiscard]] const CMPIResult* handle() const { return &handle_; }

 private:
  static Taker& takerOf(const CMPIResult* result) { return *static_cast<Taker*>(result->hdl); }
  static CMPIResultFT& table() {
    static CMPIResultFT functions = [] {
      CMPIResultFT made{};
      made.ftVersion = CMPICurrentVersion;
      made.returnInstance = [](const CMPIResult* result, const CMPIInstance* instance) {
        return takerOf(result).instance(instance);
      };
      made.returnObjectPath = [](const CMPIResult* result, const CMPIObjectPath* path) {
        return takerOf(result).path(path);
      };
      made.returnDone = [](const CMPIResult* result) { return takerOf(result).done(); };
      return made;
    }();
    return functions;
  }

  CMPIResult handle_;
};

struct Taker {
  Answer& answer;

  template <typename Handle>
  CMPIStatus take(const Handle* handle) const {
    if (handle == nullptr) {
      ++answer.nulls;
      return {Host::nullRefused, nullptr};
    }
    answer.objects.push_back(objectOf(handle));
    return ok();
  }
  CMPIStatus path(const CMPIObjectPath* path) const { return take(path); }
  CMPIStatus instance(const CMPIInstance* instance) const { return take(instance); }
  CMPIStatus done() const {
    ++answer.done;  // and nothing else: the end of the call is the end of the answer
    return ok();
  }
};

struct Collector {
  std::vector<CMPIInstance*>& found;

  CMPIStatus path(const CMPIObjectPath*) const { return {CMPI_RC_ERR_FAILED, nullptr}; }
  CMPIStatus instance(const CMPIInstance* instance) const {
    found.push_back(const_cast<CMPIInstance*>(instance));
    return ok();
  }
  CMPIStatus done() const { return ok(); }
};

template <typename Ask>
Answer answerOf(Ask ask) {
  Answer answer;
  Taker taker{answer};
  const Result<Taker> result(taker);
  answer.status = ask(result.handle()).rc;
  return answer;
}

template <typename Interface>
Interface* interfaceOf(void* library, const std::string& factoryName, const CMPIBroker* broker) {
  using Factory = Interface* (*)(const CMPIBroker*, const CMPIContext*, CMPIStatus*);
  const auto factory = reinterpret_cast<Factory>(dlsym(library, factoryName.c_str()));
  if (factory == nullptr) {
    throw std::runtime_error("there is no " + factoryName);
  }
  CMPIStatus status = ok();
  Interface* made = factory(broker, nullptr, &status);
  EXPECT_EQ(status.rc, CMPI_RC_OK) << factoryName;
  EXPECT_NE(made, nullptr) << factoryName;
  return made;
}

}  // namespace

std::vector<std::string> Answer::paths() const {
  std::vector<std::string> texts;
  for (const Object& object : objects) {
    texts.push_back(object.path);
  }
  return texts;
}

Host::Host(const CMPIBroker* broker) {
  for (const char* file : {"SoftwareInventoryProvider.reg", "KelvoEndpointProvider.reg"}) {
    for (const auto& each : cimom::readRegistrations(std::filesystem::path(SCHEMA_FOLDER) / file)) {
      void*& library = libraries_[each.location];
      if (library == nullptr) {
        const std::string name = std::string(LIBRARY_FOLDER) + "/lib" + each.location + ".so";
        library = dlopen(name.c_str(), RTLD_NOW | RTLD_GLOBAL);
      }
      if (library == nullptr) {
        throw std::runtime_error(dlerror());
      }
      instances[each.className] =
          interfaceOf<CMPIInstanceMI>(library, each.provider + "_Create_InstanceMI", broker);
      if (each.association) {
        associations[each.className] =
            interfaceOf<CMPIAssociationMI>(library, each.provider + "_Create_AssociationMI", broker);
      }
    }
  }
}

Host::~Host() {
  unload();
}

void Host::unload() {
  for (const auto& [className, mi] : instances) {
    EXPECT_EQ(mi->ft->cleanup(mi, nullptr, 0).rc, CMPI_RC_OK) << className;
  }
  for (const auto& [className, mi] : associations) {
    EXPECT_EQ(mi->ft->cleanup(mi, nullptr, 0).rc, CMPI_RC_OK) << className;
  }
  for (const auto& [name, library] : libraries_) {
    EXPECT_EQ(dlclose(library), 0) << name;
  }
  instances.clear();
  associations.clear();
  libraries_.clear();
}

Answer Host::enumerateNames(const CMPIObjectPath* path) const {
  CMPIInstanceMI* mi = instances.at(HostileCmpi::classOf(path));
  return answerOf(
      [&](const CMPIResult* result) { return mi->ft->enumerateInstanceNames(mi, nullptr, result, path); });
}

Answer Host::enumerate(const CMPIObjectPath* path, const char** properties) const {
  CMPIInstanceMI* mi = instances.at(HostileCmpi::classOf(path));
  return answerOf([&](const CMPIResult* result) {
    return mi->ft->enumerateInstances(mi, nullptr, result, path, properties);
  });
}

Answer Host::get(const CMPIObjectPath* path) const {
  CMPIInstanceMI* mi = instances.at(HostileCmpi::classOf(path));
  return answerOf(
      [&](const CMPIResult* result) { return mi->ft->getInstance(mi, nullptr, result, path, nullptr); });
}

Answer Host::names(const CMPIObjectPath* source, const char* associationClass) const {
  CMPIAssociationMI* mi = associations.at(associationClass);
  return answerOf([&](const CMPIResult* result) {
    return mi->ft->associatorNames(mi, nullptr, result, source, associationClass, nullptr, nullptr, nullptr);
  });
}

Answer Host::associators(const CMPIObjectPath* source, const char* associationClass,
                         const Narrowing& narrowing) const {
  CMPIAssociationMI* mi = associations.at(associationClass);
  return answerOf([&](const CMPIResult* result) {
    return mi->ft->associators(mi, nullptr, result, source, associationClass, narrowing.resultClass,
                               narrowing.role, narrowing.resultRole, nullptr);
  });
}

CMPIrc Host::collect(const CMPIObjectPath* path, std::vector<CMPIInstance*>& found) const {
  const auto mi = instances.find(HostileCmpi::classOf(path));
  if (mi == instances.end()) {
    return CMPI_RC_ERR_INVALID_CLASS;
  }
  Collector collector{found};
  const Result<Collector> result(collector);
  return mi->second->ft->enumerateInstances(mi->second, nullptr, result.handle(), path, nullptr).rc;
}

void Host::serveUpcalls(tests::FakeCmpi& cmpi, UpcallKeys keys) const {
  cmpi.source = [this, &cmpi, keys](const CMPIObjectPath* asked, std::vector<CMPIInstance*>& found) {
    const CMPIObjectPath* path = keys == UpcallKeys::Kept ? asked
                                                          : cmpi.path(HostileCmpi::nameSpaceOf(asked).c_str(),
                                                                      HostileCmpi::classOf(asked).c_str());
    return collect(path, found);
  };
}

CMPIObjectPath* makePath(tests::FakeCmpi& cmpi, const char* className, const Keys& keys) {
  CMPIObjectPath* made = cmpi.path("root/cimv2", className);
  for (const auto& [name, value] : keys) {
    cmpi.setKey(made, name, cmpi.stringData(value));
  }
  return made;
}

void useInventory(const char* file) {
  setenv("ORU_INVENTORY", file, 1);
  setenv("ORU_LOG", "stderr", 1);
  setenv("ORU_LOG_LEVEL", "off", 1);
}

bool isClean(const std::string& text) {
  for (std::size_t at = 0; at < text.size();) {
    const auto byte = [&](std::size_t offset) {
      return at + offset < text.size() ? static_cast<unsigned char>(text[at + offset]) : 0U;
    };
    const std::size_t length = byte(0) < 0x80    ? 1
                               : byte(0) >= 0xF0 ? 4
                               : byte(0) >= 0xE0 ? 3
                               : byte(0) >= 0xC2 ? 2
                                                 : 0;
    if (length == 0 || byte(0) > 0xF4) {
      return false;
    }
    unsigned int character = length == 1 ? byte(0) : byte(0) & (0x7FU >> length);
    for (std::size_t i = 1; i < length; ++i) {
      if ((byte(i) & 0xC0U) != 0x80) {
        return false;
      }
      character = character << 6U | (byte(i) & 0x3FU);
    }
    if (character < 0x20 || (character >= 0x7F && character < 0xA0) || character == 0xFFFE ||
        character == 0xFFFF || (character >= 0xD800 && character < 0xE000)) {
      return false;
    }
    at += length;
  }
  return true;
}

bool isMapped(const std::string& name) {
  std::ifstream maps("/proc/self/maps");
  for (std::string line; std::getline(maps, line);) {
    if (line.find(name) != std::string::npos) {
      return true;
    }
  }
  return false;
}

}  // namespace host
