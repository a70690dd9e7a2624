// CIM operations over HTTP (DSP0200): one request in, the answer streamed out while the providers deliver.
//
// What it speaks is CIM-XML (DSP0201). Which requests may come in at all, from where and from whom, is the
// server's business.
#pragma once

#include <cimom/ObjectManager.h>
#include <cimom/http/Server.h>

#include <chrono>
#include <cstddef>
#include <functional>
#include <memory>
#include <string_view>

namespace cimom::protocol {

using Clock = std::chrono::steady_clock;

/// Bounds and surroundings of an endpoint. The values here are what a server on a machine of its own wants.
struct EndpointSettings {
  /// One line of diagnostics a call, from any thread; empty: none.
  std::function<void(std::string_view)> log = {};

  /// Enumerations that are open at once, over all users. One more is refused with
  /// CIM_ERR_SERVER_LIMITS_EXCEEDED.
  std::size_t contexts = 64;

  /// How long a context lives between two requests that use it, where its client asks for no time, and the
  /// longest that a client may ask for.
  std::chrono::seconds idleTime{60};
  std::chrono::seconds longestIdleTime{600};

  /// Objects that wait in a context for the next pull; the provider waits while there are as many.
  std::size_t waitingObjects = 256;

  /// The most that one open or pull delivers; a MaxObjectCount above it is taken for it.
  std::size_t objectsPerPull = 10000;

  /// How long a part of an enumeration waits, once it is full, for what tells it whether there is more.
  std::chrono::milliseconds lookAhead{200};

  /// Bytes of the body that are handed to the server at a time.
  std::size_t pieceSize = std::size_t{48} << 10U;

  /// Answers `GET /healthz` with 200 "ok\n", so that a server that asks for a login elsewhere can let it
  /// pass.
  bool healthz = true;

  /// What the idle time of contexts is measured with.
  std::function<Clock::time_point()> now = [] { return Clock::now(); };
};

class Endpoint {
 public:
  /// The object manager must outlive the endpoint.
  explicit Endpoint(ObjectManager& manager, EndpointSettings settings = {});

  /// Ends all open enumerations, and waits for the providers that still deliver to them. No request may be
  /// under way.
  ~Endpoint();
  Endpoint(const Endpoint&) = delete;
  Endpoint& operator=(const Endpoint&) = delete;

  /// Answers one request, on the caller's thread, for several threads at once. Returns when the answer is
  /// complete, failed, or not wanted any more. What a provider does wrong is part of the answer; this throws
  /// only what `answer` throws, and `std::bad_alloc`.
  void handle(const http::Request& request, http::Answer& answer);

  /// Refuses new enumerations and ends the open ones: whoever pulls from them is told so. For the beginning
  /// of a shutdown, while requests that are under way are still answered.
  void shutDown();

  /// Open enumerations.
  [[nodiscard]] std::size_t contexts() const;

 private:
  struct State;
  std::unique_ptr<State> state_;
};

}  // namespace cimom::protocol
