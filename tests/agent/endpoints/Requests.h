// Requests to the loaded endpoint provider over the real framework, which reads the inventory file of the
// test program.
//
// Around it is the small CMPI of the tests. Its broker has no table of services: an upcall would end the
// program.
#pragma once

#include <gtest/gtest.h>
#include <tests/support/FakeCmpi.h>

#include <string>
#include <utility>
#include <vector>

class Requests : public testing::Test {
 protected:
  static constexpr const char* computers = "KELVO_ComputerSystem";
  static constexpr const char* controllers = "KELVO_SPComputerSystem";
  static constexpr const char* ports = "KELVO_NetworkPort";

  using KeyTexts = std::vector<std::pair<const char*, const char*>>;
  using Names = std::vector<const char*>;

  Requests();
  ~Requests() override;

  /// What one request delivered.
  struct Answer {
    CMPIrc status = CMPI_RC_OK;
    std::string message;  ///< "(none)" where the status has none
    int done = 0;
    std::vector<const CMPIInstance*> instances;
    std::vector<std::string> paths;  ///< of paths and instances: NAMESPACE:CLASS.KEY=VALUE,...

    /// A property of an instance as a text; "(unset)" where it has none.
    std::string property(std::size_t instance, const char* name) const;
    /// The names of the properties of an instance, in the order in which they were set.
    std::vector<std::string> propertyNames(std::size_t instance) const;
  };

  Answer enumerateNames(const CMPIObjectPath* path);
  Answer enumerate(const CMPIObjectPath* path, const char** properties = nullptr);
  Answer get(const CMPIObjectPath* path, const char** properties = nullptr);
  Answer enumerateNames(const char* className, const KeyTexts& keys = {}) {
    return enumerateNames(path(className, keys));
  }
  Answer enumerate(const char* className, const KeyTexts& keys = {}) {
    return enumerate(path(className, keys));
  }
  Answer get(const char* className, const KeyTexts& keys) { return get(path(className, keys)); }

  CMPIObjectPath* path(const char* className, const KeyTexts& keys = {});
  Answer answerOf(const CMPIStatus& status);

  tests::FakeCmpi cmpi;
  CMPIInstanceMI* provider = nullptr;
  CMPIResultFT resultTable{};  ///< of the results that requests are given

 private:
  void* library_ = nullptr;
};
