// Requests about associations to the loaded provider over the real framework. The other providers' instances
// come from the agent's own endpoint provider, loaded beside it: the broker below hands each enumeration on.
#pragma once

#include <gtest/gtest.h>
#include <tests/support/FakeCmpi.h>

#include <string>
#include <utility>
#include <vector>

class RealAssociations : public testing::Test {
 protected:
  RealAssociations();
  ~RealAssociations() override;

  /// What one request delivered, as "Class(value of its last key)"; an association as "Class(one,other)".
  struct Answer {
    CMPIrc status = CMPI_RC_OK;
    int done = 0;
    std::vector<std::string> objects;
    std::vector<const CMPIObjectPath*> paths;  ///< of names alone
  };
  using Keys = std::vector<std::pair<const char*, const char*>>;

  Answer names(const CMPIObjectPath* source, const char* associationClass);
  Answer associators(const CMPIObjectPath* source, const char* associationClass);
  Answer enumerateNames(const char* className);
  Answer enumerate(const char* className);
  Answer get(const CMPIObjectPath* path);

  CMPIObjectPath* path(const char* className, const Keys& keys = {});
  CMPIObjectPath* software(const char* instanceId);
  CMPIObjectPath* computer(const char* name);
  CMPIObjectPath* port(const char* deviceId);

 private:
  CMPIrc askEndpoints(const CMPIObjectPath* path, std::vector<CMPIInstance*>& instances);

  tests::FakeCmpi cmpi_;
  void* library_ = nullptr;
  void* endpointLibrary_ = nullptr;
  CMPIInstanceMI* instances_ = nullptr;
  CMPIAssociationMI* associations_ = nullptr;
  CMPIInstanceMI* endpoints_ = nullptr;
};
