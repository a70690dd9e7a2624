// Elements as CMPI object paths and instances, handed to the result of a request.
//
// Every call of the object manager is checked: what fails throws `Failure`.
#pragma once

#include <agent/endpoints/Endpoints.h>
#include <agent/endpoints/Failure.h>

#include <cmpi/cmpidt.h>

#include <string>
#include <utility>
#include <vector>

namespace agent::endpoints {

/// What one request delivers. Objects belong to the object manager, as everywhere in CMPI.
class Delivery {
 public:
  Delivery(const CMPIBroker* broker, const CMPIResult* result, std::string nameSpace, const char* className)
      : broker_(broker), result_(result), nameSpace_(std::move(nameSpace)), className_(className) {}

  void path(const Keys& keys);
  /// An instance with the keys and those of the properties that `wanted` lists; null lists all.
  void instance(const Keys& keys, const std::vector<Property>& properties, const char** wanted);
  void done();

 private:
  CMPIObjectPath* makePath(const Keys& keys);
  void set(CMPIInstance* instance, const char* name, const Value& value);
  CMPIArray* makeArray(const char* name, const std::vector<std::uint16_t>& numbers);
  void check(const CMPIStatus& status, const std::string& what) const;

  const CMPIBroker* broker_;
  const CMPIResult* result_;
  std::string nameSpace_;
  const char* className_;
};

}  // namespace agent::endpoints
