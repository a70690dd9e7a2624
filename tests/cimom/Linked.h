// An object manager over the association provider, and what its answers hold.
#pragma once

#include "Asked.h"

#include <cimom/ObjectManager.h>
#include <cimom/broker/WbemUri.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <functional>
#include <string>
#include <string_view>
#include <vector>

namespace association_test {

using dispatch_test::Answer;
using dispatch_test::Lines;

inline cimom::ProviderRegistration registered(const std::string& className, bool instance, bool association,
                                              const std::string& provider = "Linking",
                                              const std::string& location = "AssociationTestProvider") {
  return {className, provider, location, instance, association, {"root/test"}, "here"};
}

inline cimom::Configuration linkedConfiguration(Lines& log) {
  cimom::Configuration result;
  result.schema = {ASSOCIATION_SCHEMA};
  // Not in the order of the schema, which is the one that counts.
  for (const char* name :
       {"TEST_Peer", "TEST_Serves", "TEST_Installed", "TEST_Runs", "TEST_HoldsMore", "TEST_Holds",
        "TEST_Silent", "TEST_Broken", "TEST_Circular", "TEST_FaultThrows", "TEST_FaultDenied",
        "TEST_FaultNulls", "TEST_FaultNoDone", "TEST_FaultStrange", "TEST_FirstCrowd", "TEST_SecondCrowd"})
    result.providers.push_back(registered(name, true, true));
  for (const char* name : {"TEST_AssociationOnly", "TEST_Remark", "TEST_Endless"})
    result.providers.push_back(registered(name, false, true));
  // Abstract: it has no associations of its own.
  result.providers.push_back(registered("TEST_Dependency", false, true));
  result.providers.push_back(registered("TEST_Asker", true, false, "Asking"));
  result.providers.push_back(registered("TEST_FaultNoFunctions", false, true, "Empty"));
  result.providers.push_back(registered("TEST_FaultNoFactory", false, true, "Unknown"));
  result.providers.push_back(registered("TEST_FaultMissing", false, true, "Linking", "NoSuchLibrary"));
  result.providerFolder = DISPATCH_FOLDER;
  result.log = [&log](std::string_view line) { log.add(line); };
  return result;
}

/// "TEST_Firmware f1", for an association "TEST_Runs(TEST_Controller c, TEST_Firmware f1)".
inline std::string shown(const cimom::ObjectPath& path) {
  std::string result(path.className());
  if (const cimom::NamedValue* name = path.find("Name"))
    return result + " " + std::string(cimom::text(name->data).value_or(""));
  char separator = '(';
  for (const cimom::NamedValue& key : path.keys()) {
    const cimom::ObjectPath* end = cimom::objectPath(key.data);
    result += separator + (end == nullptr ? "null" : shown(*end));
    separator = ',';
  }
  return result + ")";
}

class Linked : public testing::Test {
 protected:
  using Query = cimom::AssociationQuery;

  Answer associatorNames(std::string_view path, const Query& query = {}) {
    return paths([&](const cimom::PathSink& sink) { return manager_.associatorNames(path, query, sink); });
  }
  Answer associators(std::string_view path, const Query& query = {},
                     const cimom::PropertyList& properties = std::nullopt) {
    return instances(
        [&](const cimom::InstanceSink& sink) { return manager_.associators(path, query, properties, sink); });
  }
  Answer referenceNames(std::string_view path, const Query& query = {}) {
    return paths([&](const cimom::PathSink& sink) { return manager_.referenceNames(path, query, sink); });
  }
  Answer references(std::string_view path, const Query& query = {},
                    const cimom::PropertyList& properties = std::nullopt) {
    return instances(
        [&](const cimom::InstanceSink& sink) { return manager_.references(path, query, properties, sink); });
  }

  /// The far ends, which must be the same as instances and as paths.
  std::vector<std::string> ends(std::string_view path, const Query& query = {}) {
    const Answer names = associatorNames(path, query);
    const Answer objects = associators(path, query);
    EXPECT_EQ(names.objects, objects.objects);
    for (const Answer* each : {&names, &objects}) {
      EXPECT_EQ(each->outcome.status.code, CMPI_RC_OK) << each->outcome.status.description;
      EXPECT_TRUE(each->outcome.done);
      EXPECT_EQ(each->outcome.delivered, each->objects.size());
    }
    return names.objects;
  }

  /// The associations, likewise.
  std::vector<std::string> links(std::string_view path, const Query& query) {
    const Answer names = referenceNames(path, query);
    const Answer objects = references(path, query);
    EXPECT_EQ(names.objects, objects.objects);
    for (const Answer* each : {&names, &objects}) {
      EXPECT_EQ(each->outcome.status.code, CMPI_RC_OK) << each->outcome.status.description;
      EXPECT_TRUE(each->outcome.done);
    }
    return names.objects;
  }

  /// Both operations answer with this status, and with nothing else.
  void expectStatus(CMPIrc code, const std::string& reason, std::string_view path, const Query& query = {}) {
    for (const Answer& answer : {associatorNames(path, query), associators(path, query),
                                 referenceNames(path, query), references(path, query)}) {
      EXPECT_EQ(answer.outcome.status.code, code) << path;
      EXPECT_THAT(answer.outcome.status.description, testing::HasSubstr(reason));
      EXPECT_FALSE(answer.outcome.done);
      EXPECT_THAT(answer.objects, testing::IsEmpty());
    }
  }

  /// The calls that reached the provider, as it noted them, and the other lines of the log.
  [[nodiscard]] std::vector<std::string> calls() const { return logged(true); }
  [[nodiscard]] std::vector<std::string> complaints() const { return logged(false); }

  static Answer paths(const std::function<cimom::Outcome(const cimom::PathSink&)>& request) {
    Answer answer;
    answer.outcome = request([&answer](const cimom::ObjectPath& path) {
      answer.objects.push_back(shown(path));
      return true;
    });
    return answer;
  }
  static Answer instances(const std::function<cimom::Outcome(const cimom::InstanceSink&)>& request) {
    Answer answer;
    answer.outcome = request([&answer](const cimom::Instance& instance) {
      answer.objects.push_back(shown(instance.path()));
      return true;
    });
    return answer;
  }

  Lines log_;
  cimom::ObjectManager manager_{linkedConfiguration(log_)};

  static constexpr std::string_view serverPath = R"(TEST_System.Name="s")";
  static constexpr std::string_view controllerPath = R"(TEST_Controller.Name="c")";
  static constexpr std::string_view firmwarePath = R"(TEST_Firmware.Name="f1")";
  static constexpr std::string_view portPath = R"(TEST_Port.Name="p")";
  static constexpr std::string_view driverPath = R"(TEST_Software.Name="d \"quoted\" \\ and, more=")";

 private:
  [[nodiscard]] std::vector<std::string> logged(bool isCall) const {
    constexpr std::string_view mark = "call: ";
    std::vector<std::string> result;
    for (const std::string& line : log_.all()) {
      if (line.starts_with(mark) == isCall)
        result.push_back(isCall ? line.substr(mark.size()) : line);
    }
    return result;
  }
};

}  // namespace association_test
