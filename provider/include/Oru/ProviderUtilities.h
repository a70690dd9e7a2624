// CMPI helpers of the framework: what providers need to read and build object paths and instances.
//
// All are static, keep no state and may be called from any thread; each uses only the CMPI objects it is
// given, and only through their function tables, so they work in any object manager. None throws. CMPI
// objects stay owned as the CMPI standard has it (by the object manager, for the time of the request);
// strings are copied. Names of classes, keys and properties ignore case, as CIM does. Null paths and
// instances are taken calmly: 0 keys, an empty namespace, false, no effect.
#pragma once

#include <Oru/Moniker.h>
#include <cmpi/cmpidt.h>

#include <string>
#include <vector>

#pragma GCC visibility push(default)
namespace Oru {

class ProviderUtilities {
 public:
  ProviderUtilities() = delete;

  /// Class id of the path's class; 255 when the framework does not know it.
  static unsigned short getClassId(const CMPIObjectPath* path);
  /// Class id of a class name; 255 when the framework does not know it, or for null.
  static unsigned short getClassId(const char* className);

  /// True when `className` is `otherClassName` or derives from it in that namespace, by the broker's class
  /// schema. A null `className` is related to every class.
  static bool areClassesRelated(const CMPIBroker* broker, const std::string& nameSpace, const char* className,
                                const char* otherClassName);

  /// The path's namespace; empty where it has none.
  static std::string getNamespace(const CMPIObjectPath* path);

  /// Number of keys that have a value; 0 for a class path, whatever an object manager counts there.
  static unsigned short getKeyCount(const CMPIObjectPath* path);

  /// Reads a string key into `value`. False when it is missing, null, or not a string.
  static bool getKeyProperty(const CMPIObjectPath* path, const char* name, std::string& value);
  /// Reads a reference key into `*value`. False when it is missing, null, or not a reference.
  static bool getKeyProperty(const CMPIObjectPath* path, const char* name, CMPIObjectPath** value);

  /// Sets a string key.
  static void setKeyProperty(CMPIObjectPath* path, const char* name, const std::string& value);
  /// Sets a reference key.
  static void setKeyProperty(CMPIObjectPath* path, const char* name, CMPIObjectPath* value);

  /// A new path, owned by the broker's memory management, or null on failure.
  static CMPIObjectPath* createObjectPath(const CMPIBroker* broker, const char* className,
                                          std::string nameSpace);
  /// A new instance of the path's class, owned by the broker's memory management, or null on failure.
  static CMPIInstance* createInstance(const CMPIBroker* broker, CMPIObjectPath* path);

  /// Reads a string property of an instance. False when it is missing, null, or not a string. `flag` has no
  /// effect.
  static bool getProperty(const CMPIInstance* instance, const char* name, std::string& value, bool flag);

  /// Sets a string property.
  static void setProperty(CMPIInstance* instance, const char* name, std::string& value);
  /// Sets a uint16 property.
  static void setProperty(CMPIInstance* instance, const char* name, unsigned short value);
  /// Sets a boolean property.
  static void setProperty(CMPIInstance* instance, const char* name, bool value);
  /// Sets a reference property.
  static void setProperty(CMPIInstance* instance, const char* name, CMPIObjectPath* value);
  /// Sets a string property, or, when `isDateTime` is true, a datetime made from the CIM datetime text
  /// `value`; the property stays unset where the text is not a datetime to the broker.
  static void setProperty(const CMPIBroker* broker, CMPIInstance* instance, const char* name,
                          std::string& value, bool isDateTime);
  /// Sets a uint16 array property.
  static void setProperty(const CMPIBroker* broker, CMPIInstance* instance, const char* name,
                          std::vector<unsigned short>& values);
  /// Sets a string array property.
  static void setProperty(const CMPIBroker* broker, CMPIInstance* instance, const char* name,
                          std::vector<std::string>& values);

  /// Appends the path's string keys to the moniker, in order. Keys that the contract knows (InstanceID, Name,
  /// DeviceID) are written in that spelling, others as they came.
  static void transformObjectPathToMoniker(const CMPIObjectPath* path, Moniker& moniker);
  /// Writes the moniker's keys into an already created path. No effect where `*path` is null.
  static void transformMonikerToObjectPath(Moniker& moniker, CMPIObjectPath** path);
};

}  // namespace Oru
#pragma GCC visibility pop
