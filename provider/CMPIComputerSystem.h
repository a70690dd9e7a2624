// Computer systems, which another provider serves, as a cursor over the object manager's answer.
#pragma once

#include <cmpi/cmpidt.h>

#include <string>

namespace Oru::SoftwareInventoryProfileProvider {

/// Either walks all instances of a class or stands on the one with a given name. It belongs to one request on
/// one thread; instances, paths and the enumeration are the object manager's.
class CMPISIComputerSystem {
 public:
  /// `className` is kept and read by no operation: the paths that are asked about carry their class.
  CMPISIComputerSystem(const CMPIBroker* broker, const CMPIContext* context, std::string className);
  ~CMPISIComputerSystem();
  CMPISIComputerSystem(const CMPISIComputerSystem&) = delete;
  CMPISIComputerSystem& operator=(const CMPISIComputerSystem&) = delete;

  /// Asks the object manager for the instances of the path and stands on the first, or, to match by name, on
  /// the one whose Name is the path's; there, none that matches is an empty cursor. Throws
  /// `Oru::ProviderException` "Could not obtain an instance of Computer System" where the object manager
  /// refuses, and, unless it is to match by name, where the first instance cannot be had.
  void setObjectPath(const CMPIObjectPath* path, bool matchByName);

  /// Stands on the instance of an enumeration, which is read to its end, whose Name is exactly the path's.
  void findCMM(CMPIEnumeration* enumeration, const CMPIObjectPath* path);

  /// True on an instance. After the last instance of a walk it is false.
  explicit operator bool();

  /// Takes the next instance; none where the enumeration gives none.
  void operator++();

  /// The current instance's path; null where there is none.
  CMPIObjectPath* getObjectPath();

  /// The current instance as the object manager delivered it, whole, whatever `properties` lists; or null.
  CMPIInstance* getCMPIInstance(const char** properties);

 private:
  const CMPIBroker* broker;
  const CMPIContext* context;
  [[maybe_unused]] std::string className;
  CMPIInstance* currentInstance = nullptr;
  CMPIEnumeration* enumeration = nullptr;
  bool valid = false;  ///< the first instance of a walk has not been asked about
  bool matchByName = false;
};

}  // namespace Oru::SoftwareInventoryProfileProvider
