#include <cimom/protocol/CimError.h>
#include <cimom/protocol/Envelope.h>
#include <cimom/protocol/Reply.h>
#include <cimom/xml/Writer.h>

#include <algorithm>
#include <utility>

namespace cimom::protocol {

namespace {

// How long an object waits for others, so that a slow provider's client sees that there is progress.
constexpr std::chrono::milliseconds patience{100};

xml::MethodKind kindOf(const xml::MethodCall& call) {
  return call.isIntrinsic ? xml::MethodKind::intrinsic : xml::MethodKind::extrinsic;
}

}  // namespace

Reply::Reply(http::Answer& answer, const xml::MethodCall& call, Settings settings)
    : answer_(answer), call_(call), settings_(std::move(settings)) {}

void Reply::open() {
  if (opened_)
    return;
  opened_ = true;
  xml::beginResponse(buffer_, call_.messageId, call_.name, kindOf(call_));
  xml::beginReturnValue(buffer_);
}

std::string& Reply::object() {
  open();
  return buffer_;
}

bool Reply::objectDone() {
  if (keepsTogether_)
    return true;
  if (!begun_ || buffer_.size() >= settings_.pieceSize ||
      std::chrono::steady_clock::now() - lastFlush_ >= patience)
    flush();
  return wanted_;
}

void Reply::flush() {
  if (!begun_) {
    begun_ = true;
    std::vector<http::Field> fields = settings_.fields;
    if (settings_.takesTrailers && !keepsTogether_)
      fields.push_back({"Trailer", "CIMStatusCode, CIMStatusCodeDescription"});
    answer_.begin(200, std::move(fields));
  }
  write(buffer_);
  buffer_.clear();
  lastFlush_ = std::chrono::steady_clock::now();
}

void Reply::write(std::string_view text) {
  // The last object of a piece stands over a little; only what is much too long is cut.
  const std::size_t most = std::max<std::size_t>(2 * settings_.pieceSize, 1);
  while (wanted_ && !text.empty()) {
    const std::string_view piece = text.size() <= most ? text : text.substr(0, settings_.pieceSize + 1);
    wanted_ = answer_.write(piece);
    text.remove_prefix(piece.size());
  }
}

void Reply::succeed(std::string_view outParameters) {
  open();
  xml::endReturnValue(buffer_);
  buffer_ += outParameters;
  close();
}

void Reply::succeedWithoutValue() {
  xml::beginResponse(buffer_, call_.messageId, call_.name, kindOf(call_));
  close();
}

void Reply::close() {
  xml::endResponse(buffer_, kindOf(call_));
  flush();
}

void Reply::fail(CMPIrc code, std::string_view description) {
  const CMPIrc status = cimStatus(code);
  const std::string text = describe(code, description);
  if (!begun_) {
    sendError(status, text);
    return;
  }
  if (settings_.log && wanted_)
    settings_.log("the answer to " + call_.name + " breaks off with status " + std::to_string(status) + ": " +
                  percentEncoded(text));
  // What waits in the buffer is delivered too, as far as anything is.
  write(buffer_);
  buffer_.clear();
  answer_.fail(
      {{"CIMStatusCode", std::to_string(status)}, {"CIMStatusCodeDescription", percentEncoded(text)}});
  if (!answer_.started())
    sendError(status, text);
}

void Reply::sendError(CMPIrc code, const std::string& description) {
  buffer_.clear();
  xml::beginResponse(buffer_, call_.messageId, call_.name, kindOf(call_));
  xml::appendError(buffer_, code, description);
  xml::endResponse(buffer_, kindOf(call_));
  answer_.begin(200, settings_.fields);
  write(buffer_);
}

}  // namespace cimom::protocol
