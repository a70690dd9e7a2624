#include "CMPISoftwareIdentity.h"

#include <Oru/ProviderUtilities.h>
#include <Trace.h>

#include <utility>
#include <variant>

namespace Oru::SoftwareInventoryProfileProvider {

namespace {

const std::string loggerCMPISoftwareIdentity(traceCategory);

constexpr const char* className = "KELVO_SoftwareIdentity";
constexpr const char* instanceIdKey = "InstanceID";

/// The getter of a text that is published as a CIM datetime.
struct DateTime {
  bool (SoftwareIdentity::*getter)(std::string&);
};

using Getter = std::variant<bool (SoftwareIdentity::*)(std::string&), DateTime,
                            bool (SoftwareIdentity::*)(unsigned short&), bool (SoftwareIdentity::*)(bool&),
                            bool (SoftwareIdentity::*)(std::vector<unsigned short>&),
                            bool (SoftwareIdentity::*)(std::vector<std::string>&)>;

struct Property {
  const char* name;
  Getter getter;
};

/// What an instance carries, in the order in which it is set. Properties whose getters have nothing today
/// stay in the sequence: a getter that learns its value publishes it.
constexpr Property instanceProperties[] = {
    {"Caption", &SoftwareIdentity::getCaption},
    {"Description", &SoftwareIdentity::getDescription},
    {"ElementName", &SoftwareIdentity::getElementName},
    {"InstallDate", DateTime{&SoftwareIdentity::getInstallDate}},
    {"Name", &SoftwareIdentity::getName},
    {"OperationalStatus", &SoftwareIdentity::getOperationalStatus},
    {"StatusDescriptions", &SoftwareIdentity::getStatusDescriptions},
    {"HealthState", &SoftwareIdentity::getHealthState},
    {"PrimaryStatus", &SoftwareIdentity::getPrimaryStatus},
    {"DetailedStatus", &SoftwareIdentity::getDetailedStatus},
    {"OperatingStatus", &SoftwareIdentity::getOperatingStatus},
    {"CommunicationStatus", &SoftwareIdentity::getCommunicationStatus},
    {"InstanceID", &SoftwareIdentity::getInstanceID},
    {"MajorVersion", &SoftwareIdentity::getMajorVersion},
    {"MinorVersion", &SoftwareIdentity::getMinorVersion},
    {"RevisionNumber", &SoftwareIdentity::getRevisionNumber},
    {"BuildNumber", &SoftwareIdentity::getBuildNumber},
    {"VersionString", &SoftwareIdentity::getVersionString},
    {"BuildID", &SoftwareIdentity::getBuildId},
    {"TargetOperatingSystems", &SoftwareIdentity::getTargetOperatingSystems},
    {"Manufacturer", &SoftwareIdentity::getManufacturer},
    {"Languages", &SoftwareIdentity::getLanguages},
    {"Classifications", &SoftwareIdentity::getClassifications},
    {"ClassificationDescriptions", &SoftwareIdentity::getClassificationDescriptions},
    {"SerialNumber", &SoftwareIdentity::getSerialNumber},
    {"TargetTypes", &SoftwareIdentity::getTargetTypes},
    {"IdentityInfoValue", &SoftwareIdentity::getIdentityInfoValue},
    {"IdentityInfoType", &SoftwareIdentity::getIdentityInfoType},
    {"ReleaseDate", DateTime{&SoftwareIdentity::getReleaseDate}},
    {"IsEntity", &SoftwareIdentity::isEntity},
    {"ExtendedResourceType", &SoftwareIdentity::getExtendedResourceType},
    {"OtherExtendedResourceTypeDescription", &SoftwareIdentity::getOtherExtendedResourceTypeDescription},
    {"MinExtendedResourceTypeMajorVersion", &SoftwareIdentity::getMinExtendedResourceTypeMajorVersion},
    {"MinExtendedResourceTypeMinorVersion", &SoftwareIdentity::getMinExtendedResourceTypeMinorVersion},
    {"MinExtendedResourceTypeRevisionNumber", &SoftwareIdentity::getMinExtendedResourceTypeRevisionNumber},
    {"MinExtendedResourceTypeBuildNumber", &SoftwareIdentity::getMinExtendedResourceTypeBuildNumber},
    {"TargetOSTypes", &SoftwareIdentity::getTargetOSTypes},
};

/// Sets one property of an instance if its getter has a value.
class PropertySetter {
 public:
  PropertySetter(const CMPIBroker* broker, CMPIInstance* instance, SoftwareIdentity& source,
                 PropertyValues& values)
      : broker_(broker), instance_(instance), source_(source), values_(values) {}

  void set(const Property& property) {
    std::visit([&](auto getter) { setBy(getter, property.name); }, property.getter);
  }

 private:
  void setBy(bool (SoftwareIdentity::*getter)(std::string&), const char* name) {
    if ((source_.*getter)(values_.text)) {
      ProviderUtilities::setProperty(instance_, name, values_.text);
    }
  }

  void setBy(DateTime dateTime, const char* name) {
    if ((source_.*dateTime.getter)(values_.text)) {
      ProviderUtilities::setProperty(broker_, instance_, name, values_.text, true);
    }
  }

  template <typename Scalar>
  void setBy(bool (SoftwareIdentity::*getter)(Scalar&), const char* name) {
    Scalar value{};
    if ((source_.*getter)(value)) {
      ProviderUtilities::setProperty(instance_, name, value);
    }
  }

  void setBy(bool (SoftwareIdentity::*getter)(std::vector<unsigned short>&), const char* name) {
    setArray(getter, name, values_.numbers);
  }

  void setBy(bool (SoftwareIdentity::*getter)(std::vector<std::string>&), const char* name) {
    setArray(getter, name, values_.texts);
  }

  template <typename Element>
  void setArray(bool (SoftwareIdentity::*getter)(std::vector<Element>&), const char* name,
                std::vector<Element>& values) {
    values.clear();
    if ((source_.*getter)(values)) {
      ProviderUtilities::setProperty(broker_, instance_, name, values);
    }
  }

  const CMPIBroker* broker_;
  CMPIInstance* instance_;
  SoftwareIdentity& source_;
  PropertyValues& values_;
};

}  // namespace

CMPISoftwareIdentity::CMPISoftwareIdentity(const CMPIBroker* _broker, const CMPIContext* _context,
                                           const CMPIObjectPath* objectPath)
    : broker(_broker), context(_context), nameSpace(ProviderUtilities::getNamespace(objectPath)) {
  const TraceScope scope(loggerCMPISoftwareIdentity, " _broker=", _broker, " _context=", _context,
                         " objectPath=", objectPath);
  setObjectPath(objectPath);
}

CMPISoftwareIdentity::CMPISoftwareIdentity(const CMPIBroker* _broker, const CMPIContext* _context,
                                           std::string _nameSpace)
    : broker(_broker), context(_context), nameSpace(std::move(_nameSpace)) {
  const TraceScope scope(loggerCMPISoftwareIdentity, " _broker=", _broker, " _context=", _context,
                         " _nameSpace=", nameSpace);
}

CMPISoftwareIdentity::~CMPISoftwareIdentity() {
  const TraceScope scope(loggerCMPISoftwareIdentity);
}

void CMPISoftwareIdentity::setObjectPath(const CMPIObjectPath* objectPath) {
  const TraceScope scope(loggerCMPISoftwareIdentity, " objectPath=", objectPath);
  if (ProviderUtilities::getKeyCount(objectPath) == 0) {
    return;
  }
  std::string instanceID;
  if (!ProviderUtilities::getKeyProperty(objectPath, instanceIdKey, instanceID)) {
    return;
  }
  traceVariable(loggerCMPISoftwareIdentity, "instanceID", instanceID);
  softwareIdentity.setFilter(SoftwareIdentity::InstanceIdFilter, instanceID);
}

CMPIObjectPath* CMPISoftwareIdentity::getObjectPath() {
  const TraceScope scope(loggerCMPISoftwareIdentity);
  CMPIObjectPath* path = ProviderUtilities::createObjectPath(broker, className, nameSpace);
  if (path == nullptr) {
    return nullptr;
  }
  std::string& id = values.text;
  if (!softwareIdentity.getInstanceID(id)) {
    return path;
  }
  if (id.empty()) {
    return nullptr;
  }
  ProviderUtilities::setKeyProperty(path, instanceIdKey, id);
  return path;
}

CMPIInstance* CMPISoftwareIdentity::getCMPIInstance(const char** properties) {
  const TraceScope scope(loggerCMPISoftwareIdentity, " properties=", static_cast<const void*>(properties));
  CMPIObjectPath* path = getObjectPath();
  if (path == nullptr) {
    return nullptr;
  }
  CMPIInstance* instance = ProviderUtilities::createInstance(broker, path);
  if (instance == nullptr) {
    return nullptr;
  }

  PropertySetter setter(broker, instance, softwareIdentity, values);
  for (const Property& property : instanceProperties) {
    setter.set(property);
  }
  return instance;
}

CMPISoftwareIdentity::operator bool() {
  const TraceScope scope(loggerCMPISoftwareIdentity);
  return static_cast<bool>(softwareIdentity);
}

void CMPISoftwareIdentity::operator++() {
  const TraceScope scope(loggerCMPISoftwareIdentity);
  ++softwareIdentity;
}

bool CMPISoftwareIdentity::modifyElementSoftwareStatus(const std::vector<unsigned short>& status) {
  const TraceScope scope(loggerCMPISoftwareIdentity);
  return softwareIdentity.modifyElementSoftwareStatus(status);
}

}  // namespace Oru::SoftwareInventoryProfileProvider
