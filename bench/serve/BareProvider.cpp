// A provider with next to nothing to do: every instance sets the same twelve properties of its class. What a
// request for it takes is the object manager's time. How many there are says BARE_INSTANCES, else 1000.
#include <cmpi/cmpift.h>
#include <cmpi/cmpimacs.h>

#include <cstdlib>
#include <string>

namespace {

const CMPIBroker* broker = nullptr;

unsigned long count() {
  static const unsigned long instances = [] {
    const char* const text = std::getenv("BARE_INSTANCES");
    return text == nullptr ? 1000UL : std::strtoul(text, nullptr, 10);
  }();
  return instances;
}

template <class T>
void set(CMPIInstance* instance, const char* name, T CMPIValue::*member, T number, CMPIType type) {
  CMPIValue value{};
  value.*member = number;
  CMSetProperty(instance, name, &value, type);
}

void setText(CMPIInstance* instance, const char* name, const char* text) {
  CMSetProperty(instance, name, reinterpret_cast<const CMPIValue*>(text), CMPI_chars);
}

/// Asked by its own address, so that both classes are served by one function.
struct Asked {
  const char* nameSpace;
  const char* className;
};

Asked asked(const CMPIObjectPath* path) {
  return {CMGetCharPtr(CMGetNameSpace(path, nullptr)), CMGetCharPtr(CMGetClassName(path, nullptr))};
}

CMPIObjectPath* makePath(const Asked& asked, const std::string& id) {
  CMPIObjectPath* path = CMNewObjectPath(broker, asked.nameSpace, asked.className, nullptr);
  CMAddKey(path, "InstanceID", reinterpret_cast<const CMPIValue*>(id.c_str()), CMPI_chars);
  return path;
}

CMPIInstance* makeInstance(const Asked& asked, unsigned long number) {
  const std::string id = std::to_string(number) + "@bare";
  CMPIInstance* instance = CMNewInstance(broker, makePath(asked, id), nullptr);
  setText(instance, "InstanceID", id.c_str());
  setText(instance, "Name", "firmware");
  setText(instance, "Description", "Firmware of a network controller");
  setText(instance, "VersionString", "20.5.13 (0x8000)");
  setText(instance, "Manufacturer", "A maker of controllers");
  setText(instance, "BuildText", "build 2024-07");
  set<CMPIUint16>(instance, "MajorVersion", &CMPIValue::uint16, 20, CMPI_uint16);
  set<CMPIUint16>(instance, "MinorVersion", &CMPIValue::uint16, 5, CMPI_uint16);
  set<CMPIUint64>(instance, "Size", &CMPIValue::uint64, 1048576 + number, CMPI_uint64);
  set<CMPIBoolean>(instance, "IsEntity", &CMPIValue::boolean, 1, CMPI_boolean);
  CMPIValue date{};
  date.dateTime = CMNewDateTimeFromChars(broker, "20240719000000.000000+000", nullptr);
  CMSetProperty(instance, "InstallDate", &date, CMPI_dateTime);
  CMPIValue list{};
  list.array = CMNewArray(broker, 1, CMPI_uint16, nullptr);
  CMPIValue firmware{};
  firmware.uint16 = 10;
  CMSetArrayElementAt(list.array, 0, &firmware, CMPI_uint16);
  CMSetProperty(instance, "Classifications", &list, CMPI_uint16A);
  return instance;
}

CMPIStatus ok() {
  return {CMPI_RC_OK, nullptr};
}

CMPIStatus cleanup(CMPIInstanceMI*, const CMPIContext*, CMPIBoolean) {
  return ok();
}

CMPIStatus enumerateInstanceNames(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
                                  const CMPIObjectPath* path) {
  const Asked which = asked(path);
  for (unsigned long number = 0; number < count(); ++number) {
    CMReturnObjectPath(result, makePath(which, std::to_string(number) + "@bare"));
  }
  CMReturnDone(result);
  return ok();
}

CMPIStatus enumerateInstances(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
                              const CMPIObjectPath* path, const char**) {
  const Asked which = asked(path);
  for (unsigned long number = 0; number < count(); ++number) {
    CMReturnInstance(result, makeInstance(which, number));
  }
  CMReturnDone(result);
  return ok();
}

CMPIStatus getInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
                       const CMPIObjectPath* path, const char**) {
  const CMPIData key = CMGetKey(path, "InstanceID", nullptr);
  if (key.value.string == nullptr) {
    return {CMPI_RC_ERR_NOT_FOUND, nullptr};
  }
  CMReturnInstance(result,
                   makeInstance(asked(path), std::strtoul(CMGetCharPtr(key.value.string), nullptr, 10)));
  CMReturnDone(result);
  return ok();
}

CMPIInstanceMIFT functions = {CMPICurrentVersion,
                              CMPICurrentVersion,
                              "BareProvider",
                              cleanup,
                              enumerateInstanceNames,
                              enumerateInstances,
                              getInstance,
                              nullptr,
                              nullptr,
                              nullptr,
                              nullptr};
CMPIInstanceMI mi = {nullptr, &functions};

}  // namespace

extern "C" [[gnu::visibility("default")]] CMPIInstanceMI* BareProvider_Create_InstanceMI(
    const CMPIBroker* given, const CMPIContext*, CMPIStatus* status) {
  broker = given;
  if (status != nullptr) {
    *status = ok();
  }
  return &mi;
}
