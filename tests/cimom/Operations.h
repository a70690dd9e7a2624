// An object manager over the operations provider.
#pragma once

#include "Asked.h"

#include <cimom/ObjectManager.h>
#include <cimom/broker/Arena.h>
#include <cimom/broker/WbemUri.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>
#include <string_view>
#include <vector>

namespace operations_test {

using dispatch_test::Answer;
using dispatch_test::Lines;

inline cimom::Configuration operationsConfiguration(Lines& log) {
  const auto registered = [](const std::string& className, const std::string& provider, bool keepsNothing) {
    return cimom::ProviderRegistration{
        className, provider, "OperationsTestProvider", true, false, {"root/test"}, "here", keepsNothing};
  };
  cimom::Configuration result;
  result.schema = {OPERATIONS_SCHEMA};
  for (const char* name : {"TEST_Record", "TEST_Pair", "TEST_Single", "TEST_Lasting100", "TEST_Lasting10000"})
    result.providers.push_back(registered(name, "Operations", false));
  for (const char* name : {"TEST_Plain100", "TEST_Plain10000", "TEST_Plain100000", "TEST_Walking100",
                           "TEST_Walking10000", "TEST_Asking100", "TEST_Asking10000"})
    result.providers.push_back(registered(name, "Operations", true));
  result.providers.push_back(registered("TEST_Idle", "Idle", false));
  result.providerFolder = DISPATCH_FOLDER;
  result.log = [&log](std::string_view line) { log.add(line); };
  return result;
}

class Operations : public testing::Test {
 protected:
  [[nodiscard]] cimom::ObjectPath* path(std::string_view text) {
    return cimom::parseWbemUri(arena_, manager_.classTable(), text);
  }

  /// An instance that a client has made; its number is set.
  [[nodiscard]] cimom::Instance* instance(std::string_view pathText, CMPIUint32 number) {
    cimom::Instance* result = cimom::Instance::create(arena_, *path(pathText));
    CMPIValue value;
    value.uint32 = number;
    EXPECT_EQ(result->setProperty("Number", &value, CMPI_uint32), CMPI_RC_OK);
    return result;
  }

  Answer create(const cimom::Instance& made, std::string_view nameSpace = "root/test") {
    Answer answer;
    answer.outcome = manager_.createInstance(nameSpace, made, [&answer](const cimom::ObjectPath& path) {
      answer.objects.push_back(cimom::formatWbemUri(path));
      return true;
    });
    return answer;
  }

  Answer query(std::string_view language, std::string_view text, std::string_view nameSpace = "root/test") {
    Answer answer;
    answer.outcome =
        manager_.execQuery(nameSpace, language, text, [&answer](const cimom::Instance& instance) {
          answer.objects.push_back(dispatch_test::shown(instance));
          return true;
        });
    return answer;
  }

  Lines log_;
  cimom::ObjectManager manager_{operationsConfiguration(log_)};
  cimom::Arena arena_;
};

}  // namespace operations_test
