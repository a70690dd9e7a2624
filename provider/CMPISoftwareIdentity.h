// The software elements as CMPI object paths and instances of KELVO_SoftwareIdentity.
#pragma once

#include <cmpi/cmpidt.h>

#include <string>
#include <vector>

#include "Linux/SoftwareIdentity.h"

namespace Oru::SoftwareInventoryProfileProvider {

inline constexpr const char* softwareIdentityClassName = "KELVO_SoftwareIdentity";

/// Where getters put what they find, shared by all properties and kept from one instance to the next, so that
/// its room is made once for a request.
struct PropertyValues {
  std::string text;
  std::vector<unsigned short> numbers;
  std::vector<std::string> texts;
};

/// A cursor like the SoftwareIdentity that it wraps. It belongs to one request on one thread; the broker, the
/// context and all CMPI objects that it returns are the object manager's.
class CMPISoftwareIdentity {
 public:
  /// Walks every element, or, for a path with the key InstanceID, the element that it names. Throws
  /// `Oru::InstrumentationException` where the machine has no software element at all.
  CMPISoftwareIdentity(const CMPIBroker* broker, const CMPIContext* context,
                       const CMPIObjectPath* objectPath);
  /// Walks every element; paths are made in `nameSpace`. Throws as above.
  CMPISoftwareIdentity(const CMPIBroker* broker, const CMPIContext* context, std::string nameSpace);
  ~CMPISoftwareIdentity();
  CMPISoftwareIdentity(const CMPISoftwareIdentity&) = delete;
  CMPISoftwareIdentity& operator=(const CMPISoftwareIdentity&) = delete;

  /// Narrows the walk to the element that the path's InstanceID names. A path without keys or without
  /// InstanceID changes nothing.
  void setObjectPath(const CMPIObjectPath* objectPath);

  /// The current element's path; null where the broker makes none.
  CMPIObjectPath* getObjectPath();

  /// The current element's instance with all its properties, whatever `properties` lists: the broker applies
  /// the list. Null where the broker makes no path or no instance.
  CMPIInstance* getCMPIInstance(const char** properties);

  explicit operator bool();
  void operator++();

  /// Writes the element software status of the current element; the framework's result.
  bool modifyElementSoftwareStatus(const std::vector<unsigned short>& status);

 private:
  const CMPIBroker* broker;
  [[maybe_unused]] const CMPIContext* context;
  std::string nameSpace;
  SoftwareIdentity softwareIdentity;
  PropertyValues values;
};

}  // namespace Oru::SoftwareInventoryProfileProvider
