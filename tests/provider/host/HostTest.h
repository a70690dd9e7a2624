// Requests to both providers from one object manager, whose manners each test sets.
#pragma once

#include <gtest/gtest.h>
#include <tests/schema/Compiled.h>

#include <array>
#include <string>
#include <vector>

#include "Host.h"

class HostTest : public testing::Test {
 protected:
  using Keys = host::Keys;

  HostTest() : providers(prepared(cmpi)) { providers.serveUpcalls(cmpi); }

  CMPIObjectPath* path(const char* className, const Keys& keys = {}) {
    return host::makePath(cmpi, className, keys);
  }
  CMPIObjectPath* softwareOf(const char* instanceId) {
    return path(host::software, {{"InstanceID", instanceId}});
  }
  CMPIObjectPath* computer(const char* className, const char* name) {
    return path(className, {{"CreationClassName", className}, {"Name", name}});
  }

  /// The whole of what both providers publish, by every operation: each answer as one text, its objects with
  /// all that they hold.
  std::vector<std::string> everything();

  /// Has every path count the keys of its class.
  void countKeysOfClasses();

  /// The types that the schema declares.
  static std::optional<CMPIType> declaredType(const std::string& className, const std::string& property);

  static constexpr std::array classes{host::software, host::installed, host::network,     host::bmc,
                                      host::bios,     host::computers, host::controllers, host::ports};
  static constexpr std::array associationClasses{host::installed, host::network, host::bmc, host::bios};

  tests::HostileCmpi cmpi;
  host::Host providers;

 private:
  static const CMPIBroker* prepared(const tests::HostileCmpi& cmpi);
  static const cimom::ClassRepository& schema();
};
