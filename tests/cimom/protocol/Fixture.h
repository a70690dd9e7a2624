// An endpoint over the protocol tests' provider, requests to it, and a double of the server that answers.
#pragma once

#include "Control.h"

#include <cimom/ObjectManager.h>
#include <cimom/http/Server.h>
#include <cimom/protocol/Endpoint.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <atomic>
#include <chrono>
#include <functional>
#include <memory>
#include <mutex>
#include <string>
#include <string_view>
#include <vector>

namespace protocol_test {

using cimom::http::Field;
using cimom::http::Request;

/// Lines of diagnostics.
class Lines {
 public:
  void add(std::string_view line);
  [[nodiscard]] std::vector<std::string> all() const;

 private:
  mutable std::mutex mutex_;
  std::vector<std::string> lines_;
};

/// What reached the client.
class Recorded final : public cimom::http::Answer {
 public:
  void begin(int status, std::vector<Field> fields) override;
  bool write(std::string_view bytes) override;
  void fail(std::vector<Field> trailers) override;
  [[nodiscard]] bool started() const override;

  /// Empty where there is none.
  [[nodiscard]] std::string field(std::string_view name) const;
  [[nodiscard]] bool has(std::string_view name) const;

  // How the server and the client behave.
  std::size_t takes = static_cast<std::size_t>(-1);  ///< pieces until the client is gone
  bool holdsBack = false;                            ///< nothing leaves before the end: HTTP/1.0
  std::function<void()> onWrite = {};

  int status = 0;
  std::vector<Field> fields;
  std::string body;
  std::vector<std::size_t> pieces;
  bool failed = false;
  std::vector<Field> trailers;
};

/// A parameter and the XML of its value; of texts, `text` makes it.
struct Given {
  std::string name;
  std::string xml;
};

std::string text(std::string_view value);
std::string texts(const std::vector<std::string>& values);
std::string className(std::string_view name);
/// With the key Name.
std::string instanceName(std::string_view className, std::string_view name);
Given flag(const std::string& name, bool value);

/// A POST of an intrinsic method, as clients send it.
Request request(const std::string& method, const std::vector<Given>& parameters = {},
                const std::string& nameSpace = "root/test");
/// The header of this name, which is added where it is missing.
std::string& header(Request& request, const std::string& name);
void removeHeader(Request& request, std::string_view name);

/// What stands between each `open` and the `close` that follows it.
std::vector<std::string> between(std::string_view body, std::string_view open, std::string_view close);
/// "TEST_Item a": class and first key of each instance name, in order.
std::vector<std::string> names(std::string_view body);
/// NAME of each property, in order.
std::vector<std::string> properties(std::string_view body);
/// CODE of an error; -1 where there is none.
int errorCode(std::string_view body);
std::string errorText(std::string_view body);
/// The text of an output parameter; "none" where there is no such parameter.
std::string outParameter(std::string_view body, std::string_view name);

class Protocol : public testing::Test {
 protected:
  Protocol();
  ~Protocol() override;

  /// The endpoint is made anew with what `settings` has now.
  void restart();

  /// The structure of every whole answer in XML is checked.
  Recorded send(const Request& request) const;
  /// Sends an operation that must be answered well.
  std::string ask(const std::string& method, const std::vector<Given>& parameters = {}) const;
  /// Sends an operation that must be answered with this error, which must have a description.
  std::string expectError(int code, const std::string& method, const std::vector<Given>& parameters = {},
                          const std::string& nameSpace = "root/test") const;
  /// Waits until a value of the provider is as expected; false after long.
  [[nodiscard]] bool waitFor(std::size_t Control::*member, std::size_t value);

  Lines log_;
  cimom::protocol::EndpointSettings settings_;
  std::atomic<std::chrono::seconds> passed_{std::chrono::seconds(0)};  ///< by the endpoint's clock
  cimom::ObjectManager manager_;
  Control& control_;
  std::unique_ptr<cimom::protocol::Endpoint> endpoint_;
};

}  // namespace protocol_test
