// What DSP0200 asks of the HTTP around a CIM message: methods, headers, media types.
#pragma once

#include <cimom/http/Server.h>
#include <cimom/xml/Request.h>

#include <optional>
#include <stdexcept>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace cimom::protocol {

/// A request that is not tried: what its HTTP answer says. `what()` tells people why.
class Refusal : public std::runtime_error {
 public:
  Refusal(int status, std::string cimError, const std::string& reason, std::vector<http::Field> fields = {})
      : std::runtime_error(reason),
        status_(status),
        cimError_(std::move(cimError)),
        fields_(std::move(fields)) {}

  [[nodiscard]] int status() const { return status_; }
  /// The value of the CIMError header; empty: none.
  [[nodiscard]] const std::string& cimError() const { return cimError_; }
  /// Headers that the status asks for: Allow.
  [[nodiscard]] const std::vector<http::Field>& fields() const { return fields_; }

 private:
  int status_;
  std::string cimError_;
  std::vector<http::Field> fields_;
};

/// The mandatory extension of an M-POST (RFC 2774): CIM's headers have its number before their names.
struct Extension {
  std::string uri;
  std::string prefix;  ///< "73-"; empty where the client gave no number
};

/// The headers of one CIM request.
class Envelope {
 public:
  /// Reads methods and Man alone, so that a refusal of the rest is already spelled as the request is. Throws
  /// `Refusal`: 405 for a method other than POST and M-POST, 400 for an M-POST that declares nothing, 510 for
  /// one that declares what is not CIM's.
  explicit Envelope(const http::Request& request);

  /// Checks all headers that do not depend on the body. Throws `Refusal`: 400 (no CIMOperation, or another
  /// than MethodCall; a header that is no percent-encoded text), 501 (another major version of the protocol,
  /// a batch), 415 (a body that is no XML in a character set that is read here), 406 (a client that takes no
  /// XML, or no UTF-8).
  void check();

  /// Holds CIMMethod and CIMObject against the body. Throws `Refusal`: 400 with "header-mismatch".
  void checkAgainst(const xml::MethodCall& call) const;

  /// The headers of an answer in XML.
  [[nodiscard]] std::vector<http::Field> answerFields() const;
  /// The headers of a refusal.
  [[nodiscard]] std::vector<http::Field> refusalFields(const Refusal& refusal) const;

 private:
  [[nodiscard]] const std::string* cimField(std::string_view name) const;
  [[nodiscard]] std::optional<std::string> decodedField(std::string_view name) const;
  void checkMediaTypes();
  void addExtension(std::vector<http::Field>& fields) const;

  const http::Request& request_;
  std::optional<Extension> extension_;  ///< none: POST
  bool asTextXml_ = false;              ///< the client takes text/xml alone
};

/// Decodes %XX; none where a percent sign is followed by anything else.
[[nodiscard]] std::optional<std::string> percentDecoded(std::string_view text);

/// Encodes what a header cannot carry, and percent signs.
[[nodiscard]] std::string percentEncoded(std::string_view text);

}  // namespace cimom::protocol
