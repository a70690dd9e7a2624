#include <bench/Measurements.h>
#include <bench/SampleMachine.h>
#include <malloc.h>
#include <unistd.h>

#include <algorithm>
#include <fstream>
#include <stdexcept>

namespace bench {

namespace {

constexpr const char* nameSpace = "root/cimv2";
constexpr const char* className = "KELVO_SoftwareIdentity";

std::size_t delivered(const cimom::Outcome& outcome) {
  if (outcome.status.code != CMPI_RC_OK || !outcome.done) {
    throw std::runtime_error("a request failed: status " + std::to_string(outcome.status.code) + " " +
                             outcome.status.description);
  }
  return outcome.delivered;
}

std::string describe(const CMPIData& data) {
  if (const auto text = cimom::text(data)) {
    return std::string(*text);
  }
  if (const auto date = cimom::dateTimeText(data)) {
    return std::string(*date);
  }
  if ((data.type & CMPI_ARRAY) != 0) {
    std::string list;
    for (const CMPIData& element : cimom::elements(data)) {
      list += describe(element) + ",";
    }
    return list;
  }
  return std::to_string(data.value.uint16);
}

}  // namespace

Peer::Peer(const std::filesystem::path& build, const std::string& provider) {
  cimom::Configuration configuration;
  const std::filesystem::path schema = build / "share/swinv/schema";
  for (const char* file : {"CIM_Software.mof", "CIM_System.mof", "CIM_Device.mof", "KELVO_Endpoints.mof",
                           "KELVO_SoftwareInventory.mof"})
    configuration.schema.push_back(schema / file);
  configuration.providerFolder = build / "lib";
  cimom::ProviderRegistration registration;
  registration.className = className;
  registration.provider = provider;
  registration.location = provider;
  registration.instance = true;
  registration.nameSpaces = {nameSpace};
  configuration.providers = {registration};
  manager_ = std::make_unique<cimom::ObjectManager>(std::move(configuration));
}

std::size_t Peer::instances() {
  return delivered(manager_->enumerateInstances(nameSpace, className, std::nullopt,
                                                [](const cimom::Instance&) { return true; }));
}

std::size_t Peer::names() {
  return delivered(
      manager_->enumerateInstanceNames(nameSpace, className, [](const cimom::ObjectPath&) { return true; }));
}

std::size_t Peer::get(const std::string& instanceId) {
  return delivered(manager_->getInstance(std::string(className) + ".InstanceID=\"" + instanceId + "\"",
                                         std::nullopt, [](const cimom::Instance&) { return true; }));
}

void Peer::askForNothing() {
  // No node has the number 0.
  const cimom::Outcome outcome =
      manager_->getInstance(std::string(className) + ".InstanceID=\"1@0\"", std::nullopt,
                            [](const cimom::Instance&) { return true; });
  if (outcome.status.code != CMPI_RC_ERR_NOT_FOUND) {
    throw std::runtime_error("asking for a node that there is not gave status " +
                             std::to_string(outcome.status.code) + " " + outcome.status.description);
  }
}

std::vector<std::string> Peer::describeInstances() {
  std::vector<std::string> texts;
  delivered(
      manager_->enumerateInstances(nameSpace, className, std::nullopt, [&](const cimom::Instance& instance) {
        std::string text;
        for (const cimom::NamedValue& property : instance.properties()) {
          if (!cimom::isNull(property.data)) {
            text.append(property.name).append("=").append(describe(property.data)).append(";");
          }
        }
        texts.push_back(std::move(text));
        return true;
      }));
  return texts;
}

std::vector<std::string> Peer::instanceIds() {
  std::vector<std::string> ids;
  delivered(manager_->enumerateInstanceNames(nameSpace, className, [&](const cimom::ObjectPath& path) {
    ids.emplace_back(cimom::text(path.keys().front().data).value_or(""));
    return true;
  }));
  return ids;
}

namespace {

constexpr const char* installedClass = "KELVO_InstalledSoftwareIdentity";

std::vector<std::filesystem::path> filesOf(const std::filesystem::path& folder,
                                           const std::string& extension) {
  std::vector<std::filesystem::path> files;
  for (const auto& entry : std::filesystem::directory_iterator(folder)) {
    if (entry.path().extension() == extension) {
      files.push_back(entry.path());
    }
  }
  std::sort(files.begin(), files.end());
  return files;
}

}  // namespace

Associations::Associations(const std::filesystem::path& build) {
  const std::filesystem::path schema = build / "share/swinv/schema";
  cimom::Configuration configuration;
  configuration.schema = filesOf(schema, ".mof");
  configuration.providerFolder = build / "lib";
  for (const std::filesystem::path& file : filesOf(schema, ".reg")) {
    for (cimom::ProviderRegistration& registration : cimom::readRegistrations(file)) {
      configuration.providers.push_back(std::move(registration));
    }
  }
  manager_ = std::make_unique<cimom::ObjectManager>(configuration);
}

std::string Associations::computer() {
  return std::string(R"(KELVO_ComputerSystem.CreationClassName="KELVO_ComputerSystem",Name=")") +
         sampleComputerName + '"';
}

std::string Associations::software(const std::string& instanceId) {
  return std::string(className) + ".InstanceID=\"" + instanceId + '"';
}

std::size_t Associations::installedNames(const std::string& path) {
  return delivered(manager_->associatorNames(path, {.associationClass = installedClass},
                                             [](const cimom::ObjectPath&) { return true; }));
}

std::size_t Associations::installed() {
  return delivered(manager_->enumerateInstances(nameSpace, installedClass, std::nullopt,
                                                [](const cimom::Instance&) { return true; }));
}

std::size_t residentBytes() {
  // Room that was used once and is free again would hide what is taken next.
  malloc_trim(0);
  std::size_t total = 0;
  std::size_t resident = 0;
  std::ifstream("/proc/self/statm") >> total >> resident;
  return resident * static_cast<std::size_t>(sysconf(_SC_PAGESIZE));
}

}  // namespace bench
