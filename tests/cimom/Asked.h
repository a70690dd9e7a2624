// An object manager over the test provider, and what its answers hold.
#pragma once

#include <cimom/ObjectManager.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <mutex>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace dispatch_test {

/// Lines of diagnostics.
class Lines {
 public:
  void add(std::string_view line) {
    const std::scoped_lock lock(mutex_);
    lines_.emplace_back(line);
  }
  [[nodiscard]] std::vector<std::string> all() const {
    const std::scoped_lock lock(mutex_);
    return lines_;
  }

 private:
  mutable std::mutex mutex_;
  std::vector<std::string> lines_;
};

inline cimom::Configuration configuration(Lines& log) {
  cimom::Configuration result;
  result.schema = {DISPATCH_SCHEMA};
  result.providers = cimom::readRegistrations(DISPATCH_REGISTRATION);
  result.providerFolder = DISPATCH_FOLDER;
  result.log = [&log](std::string_view line) { log.add(line); };
  return result;
}

/// "TEST_Thing a 1": class, key Name and property Number.
inline std::string shown(const cimom::Instance& instance) {
  std::string result(instance.className());
  const cimom::NamedValue* name = instance.find("Name");
  result += " " + std::string(name == nullptr ? "" : cimom::text(name->data).value_or(""));
  const cimom::NamedValue* number = instance.find("Number");
  return number == nullptr ? result : result + " " + std::to_string(number->data.value.uint32);
}

struct Answer {
  cimom::Outcome outcome;
  std::vector<std::string> objects;
};

class Dispatch : public testing::Test {
 protected:
  Answer instances(std::string_view className, const cimom::PropertyList& properties = std::nullopt,
                   std::string_view nameSpace = "root/test") {
    Answer answer;
    answer.outcome = manager_.enumerateInstances(nameSpace, className, properties,
                                                 [&answer](const cimom::Instance& instance) {
                                                   answer.objects.push_back(shown(instance));
                                                   return true;
                                                 });
    return answer;
  }

  Answer names(std::string_view className) {
    Answer answer;
    answer.outcome =
        manager_.enumerateInstanceNames("root/test", className, [&answer](const cimom::ObjectPath& path) {
          const auto name = cimom::text(path.find("Name")->data);
          answer.objects.push_back(std::string(path.className()) + " " + std::string(name.value_or("")));
          return true;
        });
    return answer;
  }

  Answer get(std::string_view path, const cimom::PropertyList& properties = std::nullopt) {
    Answer answer;
    answer.outcome = manager_.getInstance(path, properties, [&answer](const cimom::Instance& instance) {
      answer.objects.push_back(shown(instance));
      return true;
    });
    return answer;
  }

  Lines log_;
  cimom::ObjectManager manager_{configuration(log_)};
};

}  // namespace dispatch_test
