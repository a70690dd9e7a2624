#include <cimom/Names.h>
#include <cimom/protocol/Envelope.h>
#include <cimom/protocol/HeaderValues.h>

#include <algorithm>
#include <cstddef>

namespace cimom::protocol {

namespace {

constexpr std::string_view applicationXml = "application/xml";
constexpr std::string_view textXml = "text/xml";
constexpr std::string_view mappings = "http://www.dmtf.org/cim/mapping/http/v1.";

int hexDigit(char character) {
  if (character >= '0' && character <= '9')
    return character - '0';
  const char folded = foldCase(character);
  return folded >= 'a' && folded <= 'f' ? folded - 'a' + 10 : -1;
}

bool isMapping(const std::string& uri) {
  return uri.size() == mappings.size() + 1 && uri.starts_with(mappings) &&
         (uri.back() == '0' || uri.back() == '1');
}

/// The declaration of CIM's own extension among those that the client calls mandatory.
Extension mandatoryExtension(const http::Request& request) {
  const std::vector<HeaderElement> declarations = listOf(request, "Man");
  if (declarations.empty())
    throw Refusal(400, "", "an M-POST request needs a Man header");
  for (const HeaderElement& declaration : declarations) {
    if (!isMapping(declaration.value))
      throw Refusal(510, "", "the mandatory extension \"" + declaration.value + "\" is not known here");
  }
  const std::string number(declarations.front().parameter("ns"));
  if (number.find_first_not_of("0123456789") != std::string::npos)
    throw Refusal(400, "", "the ns of a Man header is a number, not \"" + number + "\"");
  return {declarations.front().value, number.empty() ? "" : number + "-"};
}

Refusal mismatch(const std::string& reason) {
  return {400, "header-mismatch", reason};
}

std::string_view withoutSlashes(std::string_view nameSpace) {
  const std::size_t first = std::min(nameSpace.find_first_not_of('/'), nameSpace.size());
  nameSpace.remove_prefix(first);
  while (nameSpace.ends_with('/'))
    nameSpace.remove_suffix(1);
  return nameSpace;
}

/// Whether the header names what the body calls: the namespace of an intrinsic method, the namespace and the
/// class of any other. Keys are not compared, because one path has many spellings.
bool namesTarget(std::string_view header, const xml::MethodCall& call) {
  if (call.isIntrinsic)
    return sameName(withoutSlashes(header), withoutSlashes(call.nameSpace));
  const std::string expected =
      std::string(withoutSlashes(call.nameSpace)) + ":" + (call.object ? call.object->className : "");
  header = withoutSlashes(header);
  return sameName(header.substr(0, expected.size()), expected) &&
         (header.size() == expected.size() || header[expected.size()] == '.');
}

}  // namespace

std::optional<std::string> percentDecoded(std::string_view text) {
  std::string plain;
  for (std::size_t at = 0; at < text.size(); ++at) {
    if (text[at] != '%') {
      plain += text[at];
      continue;
    }
    const int high = at + 2 < text.size() ? hexDigit(text[at + 1]) : -1;
    const int low = high >= 0 ? hexDigit(text[at + 2]) : -1;
    if (low < 0)
      return std::nullopt;
    plain += static_cast<char>(high * 16 + low);
    at += 2;
  }
  return plain;
}

std::string percentEncoded(std::string_view text) {
  constexpr std::string_view digits = "0123456789ABCDEF";
  std::string encoded;
  for (const char character : text) {
    const auto byte = static_cast<unsigned char>(character);
    if (byte >= 0x20 && byte < 0x7F && character != '%') {
      encoded += character;
    } else {
      encoded += '%';
      encoded += digits[byte >> 4U];
      encoded += digits[byte & 15U];
    }
  }
  return encoded;
}

Envelope::Envelope(const http::Request& request) : request_(request) {
  if (request.method == "M-POST")
    extension_ = mandatoryExtension(request);
  else if (request.method != "POST")
    throw Refusal(405, "", "CIM operations are sent with POST or M-POST", {{"Allow", "POST, M-POST"}});
}

const std::string* Envelope::cimField(std::string_view name) const {
  return request_.field(extension_ ? extension_->prefix + std::string(name) : std::string(name));
}

std::optional<std::string> Envelope::decodedField(std::string_view name) const {
  const std::string* value = cimField(name);
  if (value == nullptr)
    return std::nullopt;
  std::optional<std::string> plain = percentDecoded(*value);
  if (!plain)
    throw mismatch("the header " + std::string(name) + " is not percent-encoded as it should be");
  return plain;
}

void Envelope::check() {
  const std::string* operation = cimField("CIMOperation");
  if (operation == nullptr)
    throw Refusal(400, "unsupported-operation", "the header CIMOperation is missing");
  if (!sameName(*operation, "MethodCall"))
    throw Refusal(400, "unsupported-operation", "the CIMOperation \"" + *operation + "\" is not known here");
  const std::string* version = cimField("CIMProtocolVersion");
  if (version != nullptr && *version != "1" && !version->starts_with("1."))
    throw Refusal(501, "unsupported-protocol-version", "versions 1.x of the protocol are spoken here",
                  {{"CIMProtocolVersion", "1.3"}});
  if (cimField("CIMBatch") != nullptr)
    throw Refusal(501, "multiple-requests-unsupported", "one request is taken at a time, not a batch");
  checkMediaTypes();
}

void Envelope::checkMediaTypes() {
  const std::vector<HeaderElement> content = listOf(request_, "Content-Type");
  const std::string type = content.empty() ? std::string(applicationXml) : content.front().value;
  if (!sameName(type, applicationXml) && !sameName(type, textXml))
    throw Refusal(415, "", "the body is XML: Content-Type is application/xml or text/xml, not " + type);
  const std::string_view charset = content.empty() ? "" : content.front().parameter("charset");
  const auto isCharset = [charset](std::string_view known) { return sameName(charset, known); };
  constexpr std::string_view known[] = {"", "utf-8", "utf8", "utf-16", "us-ascii", "iso-8859-1"};
  if (std::none_of(std::begin(known), std::end(known), isCharset))
    throw Refusal(415, "", "the character set " + std::string(charset) + " is not read here");

  const std::vector<HeaderElement> accepted = listOf(request_, "Accept");
  const bool takesApplication = accepted.empty() || accepts(accepted, applicationXml);
  asTextXml_ = !takesApplication && accepts(accepted, textXml);
  if (!takesApplication && !asTextXml_)
    throw Refusal(406, "", "answers are application/xml or text/xml, which Accept does not allow");
  const std::vector<HeaderElement> charsets = listOf(request_, "Accept-Charset");
  if (!charsets.empty() && !accepts(charsets, "utf-8"))
    throw Refusal(406, "", "answers are UTF-8, which Accept-Charset does not allow");
}

void Envelope::checkAgainst(const xml::MethodCall& call) const {
  const std::optional<std::string> method = decodedField("CIMMethod");
  if (!method)
    throw mismatch("the header CIMMethod is missing");
  if (!sameName(*method, call.name))
    throw mismatch("the header CIMMethod says \"" + *method + "\", the body \"" + call.name + "\"");
  const std::optional<std::string> object = decodedField("CIMObject");
  if (!object)
    throw mismatch("the header CIMObject is missing");
  if (!namesTarget(*object, call))
    throw mismatch("the header CIMObject says \"" + *object + "\", which is not what the body calls");
}

void Envelope::addExtension(std::vector<http::Field>& fields) const {
  if (!extension_)
    return;
  // Ext says that the extension was understood; it must not be answered from a cache.
  fields.push_back({"Ext", ""});
  fields.push_back({"Cache-Control", "no-cache"});
  const std::string number = extension_->prefix.empty()
                                 ? ""
                                 : " ; ns=" + extension_->prefix.substr(0, extension_->prefix.size() - 1);
  fields.push_back({"Man", extension_->uri + number});
}

std::vector<http::Field> Envelope::answerFields() const {
  const std::string type(asTextXml_ ? textXml : applicationXml);
  std::vector<http::Field> fields = {{"Content-Type", type + "; charset=utf-8"}};
  addExtension(fields);
  fields.push_back({(extension_ ? extension_->prefix : "") + "CIMOperation", "MethodResponse"});
  return fields;
}

std::vector<http::Field> Envelope::refusalFields(const Refusal& refusal) const {
  std::vector<http::Field> fields = {{"Content-Type", "text/plain; charset=utf-8"}};
  addExtension(fields);
  const std::string prefix = extension_ ? extension_->prefix : "";
  if (!refusal.cimError().empty())
    fields.push_back({prefix + "CIMError", refusal.cimError()});
  for (const http::Field& field : refusal.fields())
    fields.push_back({field.name.starts_with("CIM") ? prefix + field.name : field.name, field.value});
  return fields;
}

}  // namespace cimom::protocol
