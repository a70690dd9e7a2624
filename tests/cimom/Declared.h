// An object manager that serves the declared instances of a text, beside the operations provider.
#pragma once

#include "Asked.h"
#include "Linked.h"

#include <cimom/ObjectManager.h>
#include <cimom/broker/WbemUri.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <string_view>
#include <vector>

namespace declared_test {

using dispatch_test::Answer;
using dispatch_test::Lines;

inline cimom::Configuration declaredConfiguration(Lines& log) {
  cimom::Configuration result;
  result.schema = {INTEROP_SCHEMA, DECLARED_SCHEMA};
  for (const char* name : {"TEST_Plain3", "TEST_Broken"})
    result.providers.push_back({name,
                                std::string_view(name) == "TEST_Broken" ? "Idle" : "Operations",
                                "OperationsTestProvider",
                                true,
                                false,
                                {"root/test"},
                                "here"});
  result.providerFolder = DISPATCH_FOLDER;
  result.log = [&log](std::string_view line) { log.add(line); };
  result.interop.emplace();
  return result;
}

class Declared : public testing::Test {
 protected:
  using Query = cimom::AssociationQuery;

  Answer instances(std::string_view nameSpace, std::string_view className,
                   const cimom::PropertyList& properties = std::nullopt) {
    return taken([&](const cimom::InstanceSink& sink) {
      return manager_.enumerateInstances(nameSpace, className, properties, sink);
    });
  }
  Answer names(std::string_view nameSpace, std::string_view className) {
    return named([&](const cimom::PathSink& sink) {
      return manager_.enumerateInstanceNames(nameSpace, className, sink);
    });
  }
  Answer get(std::string_view path) {
    return taken(
        [&](const cimom::InstanceSink& sink) { return manager_.getInstance(path, std::nullopt, sink); });
  }

  /// The far ends, which must be the same as instances and as paths.
  std::vector<std::string> ends(std::string_view path, const Query& query = {}) {
    return same(
        named([&](const cimom::PathSink& sink) { return manager_.associatorNames(path, query, sink); }),
        taken([&](const cimom::InstanceSink& sink) {
          return manager_.associators(path, query, std::nullopt, sink);
        }));
  }

  /// The associations, likewise.
  std::vector<std::string> links(std::string_view path, const Query& query = {}) {
    return same(
        named([&](const cimom::PathSink& sink) { return manager_.referenceNames(path, query, sink); }),
        taken([&](const cimom::InstanceSink& sink) {
          return manager_.references(path, query, std::nullopt, sink);
        }));
  }

  Lines log_;
  cimom::ObjectManager manager_{declaredConfiguration(log_)};

 private:
  static std::vector<std::string> same(const Answer& paths, const Answer& objects) {
    EXPECT_EQ(paths.objects, objects.objects);
    for (const Answer* each : {&paths, &objects}) {
      EXPECT_EQ(each->outcome.status.code, CMPI_RC_OK) << each->outcome.status.description;
      EXPECT_TRUE(each->outcome.done);
      EXPECT_EQ(each->outcome.delivered, each->objects.size());
    }
    return paths.objects;
  }

  template <class Request>
  static Answer taken(const Request& request) {
    Answer answer;
    answer.outcome = request([&answer](const cimom::Instance& instance) {
      answer.objects.push_back(cimom::formatWbemUri(instance.path()));
      return true;
    });
    return answer;
  }

  template <class Request>
  static Answer named(const Request& request) {
    Answer answer;
    answer.outcome = request([&answer](const cimom::ObjectPath& path) {
      answer.objects.push_back(cimom::formatWbemUri(path));
      return true;
    });
    return answer;
  }
};

/// As a path names it: "root/about:TEST_Profile.Name=\"first\"".
inline std::string profile(const std::string& name, const std::string& className = "TEST_Profile") {
  return "root/about:" + className + ".Name=\"" + name + "\"";
}

inline std::string plain(const std::string& name) {
  return "root/test:TEST_Plain3.Name=\"" + name + "\"";
}

/// A path with references to others in its keys.
inline std::string linked(const std::string& className, const std::string& one, const std::string& first,
                          const std::string& two, const std::string& second) {
  const auto quoted = [](const std::string& text) {
    std::string result = "\"";
    for (const char character : text)
      result +=
          character == '"' || character == '\\' ? std::string("\\") + character : std::string(1, character);
    return result + "\"";
  };
  return "root/about:" + className + "." + one + "=" + quoted(first) + "," + two + "=" + quoted(second);
}

inline std::string conforms(const std::string& standard, const std::string& element) {
  return linked("TEST_Conforms", "Standard", standard, "Element", element);
}

inline std::string follows(const std::string& next, const std::string& last) {
  return linked("TEST_Follows", "Next", next, "Last", last);
}

}  // namespace declared_test
