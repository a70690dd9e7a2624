// A WBEM client of the tests' own: writes requests as they are wanted, and holds each answer against DSP0203.
#pragma once

#include "XmlTree.h"
#include "tests/support/HttpClient.h"

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace serve_test {

/// Parameters of a call, as XML.
std::string classParameter(std::string_view name, std::string_view className);
std::string valueParameter(std::string_view name, std::string_view value);
std::string listParameter(std::string_view name, const std::vector<std::string>& values);
std::string instanceParameter(std::string_view name, std::string_view instanceName);

/// <INSTANCENAME> with keys that are strings.
std::string instanceName(std::string_view className,
                         const std::vector<std::pair<std::string, std::string>>& keys);

/// The message of a simple request for an intrinsic method.
std::string message(std::string_view method, std::string_view nameSpace, std::string_view parameters);

/// The whole POST, with its headers; `fields` come besides.
std::string post(std::string_view method, std::string_view nameSpace, std::string_view parameters,
                 const tests::HttpFields& fields = {}, std::string_view version = "HTTP/1.1");

struct CimAnswer {
  Element root;
  int error = 0;  ///< the CIM status; 0: none
  std::string description;

  /// The value of an output parameter ("EndOfSequence"); empty where it has none.
  [[nodiscard]] std::string parameter(std::string_view name) const;
  /// The key of each INSTANCENAME or VALUE.NAMEDINSTANCE that is not part of another path, by this name.
  [[nodiscard]] std::vector<std::string> keys(std::string_view name) const;
};

/// Reads an answer: HTTP 200, complete, valid by DSP0203. Throws `std::runtime_error` with what is wrong.
CimAnswer readCim(const tests::HttpAnswer& answer);

/// Calls on a connection that stays.
class CimClient {
 public:
  explicit CimClient(std::uint16_t port) : connection_(port) {}

  CimAnswer call(std::string_view method, std::string_view nameSpace, std::string_view parameters,
                 const tests::HttpFields& fields = {});

  /// The number of software identities that there are.
  std::size_t countIdentities();

 private:
  tests::HttpConnection connection_;
};

}  // namespace serve_test
