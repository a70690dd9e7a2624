// The object path of a request: its class, and the keys that narrow it.
#pragma once

#include <agent/endpoints/Endpoints.h>

#include <cmpi/cmpidt.h>

#include <optional>
#include <string>
#include <vector>

namespace agent::endpoints {

class RequestPath {
 public:
  /// Reads the namespace and the keys of `kind` from `path`; other keys say nothing about its elements and
  /// are left out, and one that cannot be read is one that is not set. Throws `Failure` where the namespace
  /// or the number of keys cannot be had.
  RequestPath(const CMPIObjectPath* path, const Kind& kind);

  /// Whether an element has every value that the path gives. Values are compared exactly, class names too; a
  /// value that is no text is that of no element.
  [[nodiscard]] bool passes(const Keys& keys) const;

  [[nodiscard]] const std::string& nameSpace() const { return nameSpace_; }

  /// The first key that the path lacks, or null: then it names one element.
  [[nodiscard]] const char* missingKey() const;

  /// The keys that it gives, for messages: `Name="atlas"`. What a client sent is made valid UTF-8.
  [[nodiscard]] std::string text() const;

 private:
  struct Wanted {
    const char* name;
    bool isGiven = false;
    std::optional<std::string> value;  ///< nothing: it is no text
  };
  void take(const char* name, const CMPIData& value);

  std::string nameSpace_;
  std::vector<Wanted> wanted_;  ///< in the order of the kind's keys
};

}  // namespace agent::endpoints
