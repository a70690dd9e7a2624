// Debian's wbemcli as a client, and what it prints as data.
#pragma once

#include "../cli/Process.h"

#include <map>
#include <string>
#include <vector>

namespace serve_test {

/// An object as `wbemcli -nl` prints it: a line with its path, then "-NAME=VALUE" for each property.
struct PrintedObject {
  std::string path;                               ///< without host and port: root/cimv2:CLASS.KEY="VALUE"
  std::map<std::string, std::string> properties;  ///< texts in their quotes; an empty one has no value
};

struct Printed {
  int exitCode = -1;
  std::string error;  ///< standard error, without the frame of stars
  std::vector<PrintedObject> objects;

  [[nodiscard]] std::vector<std::string> paths() const;
  /// The property of all objects, in their order.
  [[nodiscard]] std::vector<std::string> values(const std::string& property) const;
};

/// The server that is asked, and how.
struct WbemServer {
  /// Scheme, login, host and port. wbemcli takes the first "@" for the end of a login, and each InstanceID
  /// has one: a path with an InstanceID needs a login in front, whether the server wants one or not.
  std::string url;
  std::vector<std::string> options = {};

  /// `operation` is what wbemcli calls it ("ei"); `object` a path; `more` stands behind it.
  [[nodiscard]] Printed ask(const std::string& operation, const std::string& object,
                            const std::vector<std::string>& more = {}) const;
  /// With options in front, as "-ac CLASS".
  [[nodiscard]] Printed ask(const std::vector<std::string>& narrowed, const std::string& operation,
                            const std::string& object) const;
};

}  // namespace serve_test
