// Requests to the loaded provider over the real framework, which reads the inventory file of the test
// program.
//
// Below is a small CMPI of the tests, so that any path can be asked for; the object manager of this project
// refuses some of them before the provider sees them.
#pragma once

#include <gtest/gtest.h>
#include <tests/support/FakeCmpi.h>

#include <string>
#include <vector>

class RealRequests : public testing::Test {
 protected:
  RealRequests();
  ~RealRequests() override;

  /// What one request delivered.
  struct Answer {
    CMPIrc status = CMPI_RC_OK;
    int done = 0;
    std::vector<const CMPIInstance*> instances;
    std::vector<std::string> names;  ///< InstanceIDs of paths or instances

    /// A property of an instance as a text; "(unset)" where it has none.
    std::string property(std::size_t instance, const char* name) const;
  };

  Answer enumerateNames(const char* instanceId = nullptr);
  Answer enumerate(const char* instanceId = nullptr);
  Answer get(const char* instanceId);

 private:
  CMPIObjectPath* path(const char* instanceId);

  tests::FakeCmpi cmpi_;
  void* library_ = nullptr;
  CMPIInstanceMI* instances_ = nullptr;
};
