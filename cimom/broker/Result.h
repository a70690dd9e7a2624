// CMPI's result object: what a provider returns goes to a sink at once.
#pragma once

#include <cimom/broker/Objects.h>
#include <cimom/broker/Request.h>
#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>

#include <cstddef>

namespace cimom {

/// Takes each object during the call; whoever wants to keep one copies it (`copyTo`). Objects may be changed
/// (`Instance::restrictTo`): they are the provider's own, so a copy is the sink's business where the provider
/// may use them again. False ends the delivery: the provider still gets OK, and the sink nothing more.
class ResultSink {
 public:
  virtual ~ResultSink() = default;
  virtual bool instance(Instance& instance) = 0;
  virtual bool path(ObjectPath& path) = 0;
  /// What a method or property provider returns.
  virtual bool data(const CMPIData& value);
  virtual void done() {}
};

enum class Recycling {
  Off,       ///< what the provider makes lives until its request ends
  OnReturn,  ///< and this: until it returns an object, which goes as well (`Request::recycle`)
};

/// Lives where the host puts it, for one call of a provider. Nulls and foreign objects are answered with
/// CMPI_RC_ERR_INVALID_PARAMETER, what comes after the done marker with CMPI_RC_ERR_FAILED.
class Result final : public CMPIResult {
 public:
  Result(ResultSink& sink, Request& request, Recycling recycling = Recycling::Off);
  Result(const Result&) = delete;
  Result& operator=(const Result&) = delete;

  [[nodiscard]] bool done() const { return done_; }
  /// Objects handed to the sink.
  [[nodiscard]] std::size_t delivered() const { return delivered_; }
  /// Objects refused: nulls, foreign ones, and those after the done marker.
  [[nodiscard]] std::size_t refused() const { return refused_; }

 private:
  friend class ResultCalls;

  ResultSink* sink_;
  Request* request_;
  Recycling recycling_;
  bool open_ = true;
  bool done_ = false;
  std::size_t delivered_ = 0;
  std::size_t refused_ = 0;
};

}  // namespace cimom
