// Network ports, which another provider serves, as a cursor over the object manager's answer.
#pragma once

#include <cmpi/cmpidt.h>

#include <string>

namespace Oru::SoftwareInventoryProfileProvider {

/// Made for paths that name one port. Of an answer with more, the usual loop (test, use, advance) sees all
/// but the last. It belongs to one request on one thread; instances, paths and the enumeration are the object
/// manager's.
class CMPISINetworkPort {
 public:
  /// `nameSpace` is kept and read by no operation: the paths that are asked about carry theirs.
  CMPISINetworkPort(const CMPIBroker* broker, const CMPIContext* context, std::string nameSpace);
  ~CMPISINetworkPort();
  CMPISINetworkPort(const CMPISINetworkPort&) = delete;
  CMPISINetworkPort& operator=(const CMPISINetworkPort&) = delete;

  /// Asks the object manager for the instances of the path and loads the first. Throws
  /// `Oru::ProviderException` "Could not obtain an instance of Network Port" where there is none to be had;
  /// the instance loaded before then stays.
  void setObjectPath(const CMPIObjectPath* objectPath);

  /// True once for the instance that `setObjectPath` loaded; after that, whether the enumeration holds a
  /// further one beyond the one just loaded.
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
  [[maybe_unused]] std::string nameSpace;
  CMPIInstance* currentInstance = nullptr;
  CMPIEnumeration* enumeration = nullptr;
  bool firstPending = false;
};

}  // namespace Oru::SoftwareInventoryProfileProvider
