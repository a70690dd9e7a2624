// The answer to one operation: objects while they come, then how it ended.
#pragma once

#include <cimom/http/Server.h>
#include <cimom/protocol/ObjectSink.h>
#include <cimom/xml/Request.h>
#include <cmpi/cmpidt.h>

#include <chrono>
#include <cstddef>
#include <functional>
#include <string>
#include <string_view>
#include <vector>

namespace cimom::protocol {

/// Nothing goes out before the first object is there or the answer ends, so that an error until then is an
/// ordinary one. The first object goes out at once, what follows in pieces, or after a while.
///
/// An error after that goes into the trailers CIMStatusCode (decimal) and CIMStatusCodeDescription
/// (percent-encoded). CIMError, the third that DSP0200 has, is for requests that are no valid messages: those
/// are refused before anything goes out, so it is never sent as a trailer.
class Reply final : public ObjectSink {
 public:
  struct Settings {
    std::vector<http::Field> fields;  ///< of an answer in XML
    bool takesTrailers = false;
    std::size_t pieceSize = 0;
    std::function<void(std::string_view)> log;  ///< for answers that ended too early
  };

  /// All must outlive this.
  Reply(http::Answer& answer, const xml::MethodCall& call, Settings settings);

  /// Keeps the first object until more has come together: for answers of one object.
  void keepTogether() { keepsTogether_ = true; }

  std::string& object() override;
  bool objectDone() override;

  /// Ends an answer with what was delivered as its return value, which may be nothing. `outParameters` is
  /// appended as it is.
  void succeed(std::string_view outParameters = {});
  /// Ends the answer of an operation that returns nothing.
  void succeedWithoutValue();
  void fail(CMPIrc code, std::string_view description);

  /// Whether the client still takes what is written.
  [[nodiscard]] bool isWanted() const { return wanted_; }

 private:
  void open();
  void close();
  void flush();
  void write(std::string_view text);
  void sendError(CMPIrc code, const std::string& description);

  http::Answer& answer_;
  const xml::MethodCall& call_;
  Settings settings_;
  std::string buffer_;
  std::chrono::steady_clock::time_point lastFlush_{};
  bool opened_ = false;
  bool begun_ = false;
  bool wanted_ = true;
  bool keepsTogether_ = false;
};

}  // namespace cimom::protocol
