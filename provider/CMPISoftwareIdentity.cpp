#include "CMPISoftwareIdentity.h"

#include <Oru/ProviderUtilities.h>
#include <Trace.h>

#include <tuple>
#include <utility>

namespace Oru::SoftwareInventoryProfileProvider {

namespace {

const std::string loggerCMPISoftwareIdentity(traceCategory);

constexpr const char* instanceIdKey = "InstanceID";

/// The getter of a text that is published as a CIM datetime.
struct DateTime {
  bool (SoftwareIdentity::*getter)(std::string&);
};

template <typename Getter>
struct Property {
  const char* name;
  Getter getter;
};
template <typename Getter>
Property(const char*, Getter) -> Property<Getter>;

/// What an instance carries, in the order in which it is set. Properties whose getters have nothing today
/// stay in the sequence: a getter that learns its value publishes it. A tuple, so that each getter is known
/// where it is called: most are nothing but a trace scope, which the compiler then puts in the place of the
/// call.
constexpr std::tuple instanceProperties{
    Property{"Caption", &SoftwareIdentity::getCaption},
    Property{"Description", &SoftwareIdentity::getDescription},
    Property{"ElementName", &SoftwareIdentity::getElementName},
    Property{"InstallDate", DateTime{&SoftwareIdentity::getInstallDate}},
    Property{"Name", &SoftwareIdentity::getName},
    Property{"OperationalStatus", &SoftwareIdentity::getOperationalStatus},
    Property{"StatusDescriptions", &SoftwareIdentity::getStatusDescriptions},
    Property{"HealthState", &SoftwareIdentity::getHealthState},
    Property{"PrimaryStatus", &SoftwareIdentity::getPrimaryStatus},
    Property{"DetailedStatus", &SoftwareIdentity::getDetailedStatus},
    Property{"OperatingStatus", &SoftwareIdentity::getOperatingStatus},
    Property{"CommunicationStatus", &SoftwareIdentity::getCommunicationStatus},
    Property{"InstanceID", &SoftwareIdentity::getInstanceID},
    Property{"MajorVersion", &SoftwareIdentity::getMajorVersion},
    Property{"MinorVersion", &SoftwareIdentity::getMinorVersion},
    Property{"RevisionNumber", &SoftwareIdentity::getRevisionNumber},
    Property{"BuildNumber", &SoftwareIdentity::getBuildNumber},
    Property{"VersionString", &SoftwareIdentity::getVersionString},
    Property{"BuildID", &SoftwareIdentity::getBuildId},
    Property{"TargetOperatingSystems", &SoftwareIdentity::getTargetOperatingSystems},
    Property{"Manufacturer", &SoftwareIdentity::getManufacturer},
    Property{"Languages", &SoftwareIdentity::getLanguages},
    Property{"Classifications", &SoftwareIdentity::getClassifications},
    Property{"ClassificationDescriptions", &SoftwareIdentity::getClassificationDescriptions},
    Property{"SerialNumber", &SoftwareIdentity::getSerialNumber},
    Property{"TargetTypes", &SoftwareIdentity::getTargetTypes},
    Property{"IdentityInfoValue", &SoftwareIdentity::getIdentityInfoValue},
    Property{"IdentityInfoType", &SoftwareIdentity::getIdentityInfoType},
    Property{"ReleaseDate", DateTime{&SoftwareIdentity::getReleaseDate}},
    Property{"IsEntity", &SoftwareIdentity::isEntity},
    Property{"ExtendedResourceType", &SoftwareIdentity::getExtendedResourceType},
    Property{"OtherExtendedResourceTypeDescription",
             &SoftwareIdentity::getOtherExtendedResourceTypeDescription},
    Property{"MinExtendedResourceTypeMajorVersion",
             &SoftwareIdentity::getMinExtendedResourceTypeMajorVersion},
    Property{"MinExtendedResourceTypeMinorVersion",
             &SoftwareIdentity::getMinExtendedResourceTypeMinorVersion},
    Property{"MinExtendedResourceTypeRevisionNumber",
             &SoftwareIdentity::getMinExtendedResourceTypeRevisionNumber},
    Property{"MinExtendedResourceTypeBuildNumber", &SoftwareIdentity::getMinExtendedResourceTypeBuildNumber},
    Property{"TargetOSTypes", &SoftwareIdentity::getTargetOSTypes},
};

/// Sets one property of an instance if its getter has a value.
class PropertySetter {
 public:
  PropertySetter(const CMPIBroker* broker, CMPIInstance* instance, SoftwareIdentity& source,
                 PropertyValues& values)
      : broker_(broker), instance_(instance), source_(source), values_(values) {}

  template <typename Getter>
  void set(const Property<Getter>& property) {
    setBy(property.getter, property.name);
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
  CMPIObjectPath* path = ProviderUtilities::createObjectPath(broker, softwareIdentityClassName, nameSpace);
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

// The getters are put in the place of their calls, here and in the walk below: most do less than a call does.
[[gnu::flatten]] CMPIInstance* CMPISoftwareIdentity::getCMPIInstance(const char** properties) {
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
  std::apply([&](const auto&... property) { (setter.set(property), ...); }, instanceProperties);
  return instance;
}

[[gnu::flatten]] CMPISoftwareIdentity::operator bool() {
  const TraceScope scope(loggerCMPISoftwareIdentity);
  return static_cast<bool>(softwareIdentity);
}

[[gnu::flatten]] void CMPISoftwareIdentity::operator++() {
  const TraceScope scope(loggerCMPISoftwareIdentity);
  ++softwareIdentity;
}

bool CMPISoftwareIdentity::modifyElementSoftwareStatus(const std::vector<unsigned short>& status) {
  const TraceScope scope(loggerCMPISoftwareIdentity);
  return softwareIdentity.modifyElementSoftwareStatus(status);
}

}  // namespace Oru::SoftwareInventoryProfileProvider
