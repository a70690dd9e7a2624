// A request under way in a provider, and the memory of what is made for it.
//
// CMPI's `newObjectPath(broker, ...)` and its like name no request. So the host marks each call into a
// provider with a `RequestScope`: what the calling thread makes during it belongs to that request. Scopes
// nest, as calls to other providers do. Threads that a provider starts itself take part after `attachThread`,
// with a request of their own that lasts until `detachThread`. A thread without a request gets null and
// CMPI_RC_ERR_FAILED for whatever it wants to make.
#pragma once

#include <cimom/broker/Arena.h>

#include <memory>
#include <vector>

namespace cimom {

class Request {
 public:
  Request() = default;
  ~Request() = default;
  Request(const Request&) = delete;
  Request& operator=(const Request&) = delete;

  /// The request of the calling thread; null outside every `RequestScope`.
  [[nodiscard]] static Request* current();

  /// For what the request is given and what must last until its end: its path and context, answers of
  /// upcalls.
  [[nodiscard]] Arena& held() { return held_; }
  /// For what the provider makes. The innermost mark's, where the provider has set marks.
  [[nodiscard]] Arena& arena() { return marks_.empty() ? made_ : *marks_.back(); }

  /// Whether `arena` is one of this request's.
  [[nodiscard]] bool owns(const Arena& arena) const;

  /// Takes back what the provider has made so far, `held()` excepted. For providers that keep nothing of what
  /// they have returned. Does nothing while a mark is set.
  void recycle();

  /// CMPI's mark and release: what is made after a mark goes with its release. Marks inside it go too. The
  /// answer of `release` is false for a mark that is not set.
  void* mark();
  bool release(const void* mark);

 private:
  Arena held_;
  Arena made_;
  std::vector<std::unique_ptr<Arena>> marks_;
};

/// Makes `request` the calling thread's current one for as long as the scope lasts.
class RequestScope {
 public:
  explicit RequestScope(Request* request);
  ~RequestScope();
  RequestScope(const RequestScope&) = delete;
  RequestScope& operator=(const RequestScope&) = delete;

 private:
  Request* previous_;
};

}  // namespace cimom
