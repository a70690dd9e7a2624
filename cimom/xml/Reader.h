// Reads CIM-XML requests (DSP0201 2.3, DSP0203): bytes from anybody in, plain data or an error out.
//
// Loosely validating, as DSP0200 has it: elements that the document type does not know are passed over with
// their content, as are attributes; what it knows must stand where it belongs. The text may be UTF-8, UTF-16,
// ISO-8859-1 or US-ASCII. A document type declaration is tolerated and not read; one that declares anything
// itself is refused, so that no entity but the predefined ones is ever expanded. Threads: any number.
#pragma once

#include <cimom/xml/Request.h>

#include <cstddef>
#include <stdexcept>
#include <string>
#include <string_view>

namespace cimom::xml {

/// Why a request is not even tried: what the HTTP answer says. `what()` tells the line and what was expected.
class RequestError : public std::runtime_error {
 public:
  RequestError(int httpStatus, std::string cimError, const std::string& message)
      : std::runtime_error(message), httpStatus_(httpStatus), cimError_(std::move(cimError)) {}

  /// 400, or 501 for what the standard has and this server does not.
  [[nodiscard]] int httpStatus() const { return httpStatus_; }
  /// The value of the CIMError header: "request-not-well-formed", "request-not-loosely-valid",
  /// "request-not-valid" (a declaration of its own, or beyond the limits), "unsupported-cim-version",
  /// "unsupported-dtd-version", "unsupported-protocol-version", "multiple-requests-unsupported",
  /// "unsupported-operation".
  [[nodiscard]] const std::string& cimError() const { return cimError_; }

 private:
  int httpStatus_;
  std::string cimError_;
};

/// How much one request may hold. The size of the whole body is the transport's to bound.
struct Limits {
  std::size_t depth = 64;                                 ///< elements in each other
  std::size_t elements = 100'000;                         ///< of the document
  std::size_t attributes = 32;                            ///< of an element
  std::size_t attributeLength = std::size_t{64} * 1024;   ///< bytes of one value
  std::size_t textLength = std::size_t{4} * 1024 * 1024;  ///< bytes of one element's text
};

/// Throws `RequestError`.
[[nodiscard]] MethodCall readRequest(std::string_view body, const Limits& limits = {});

/// An embedded instance: the text of a property with EmbeddedObject. Throws `RequestError`.
[[nodiscard]] InstanceElement readInstance(std::string_view text, const Limits& limits = {});

}  // namespace cimom::xml
