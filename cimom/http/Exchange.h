// One request and its answer: the queue between the worker that writes it and the thread that sends it.
//
// A worker calls what `Answer` has. The sending thread, which must never wait, calls `hold`, `respond`,
// `take` and `gone`: while there is nothing to send the connection is suspended, and the worker resumes it.
// One mutex decides which of the two comes first. Whoever watches the time may `cut` on any thread.
#pragma once

#include <cimom/http/Server.h>
#include <cimom/http/Timer.h>
#include <microhttpd.h>
#include <sys/types.h>

#include <atomic>
#include <condition_variable>
#include <deque>
#include <memory>
#include <mutex>
#include <string>

namespace cimom::http {

class Flusher;
class Workers;

/// What the exchanges of a server share.
struct ExchangeParts {
  const Bounds& bounds;
  Workers& workers;
  Flusher& flusher;
  std::atomic<std::size_t>& wholeBytes;  ///< of the answers that are sent when they are whole
  std::function<void(LogLevel, std::string_view)> log;
};

class Exchange : public Answer, public std::enable_shared_from_this<Exchange> {
 public:
  explicit Exchange(const ExchangeParts& parts) : parts_(parts) {}
  ~Exchange() override { parts_.wholeBytes -= counted_; }
  Exchange(const Exchange&) = delete;
  Exchange& operator=(const Exchange&) = delete;

  Request request;  ///< constant from `hold` on

  // The worker's side.
  void begin(int status, std::vector<Field> fields) override;
  bool write(std::string_view bytes) override;
  void fail(std::vector<Field> trailers) override;
  [[nodiscard]] bool started() const override;
  /// The handler has returned.
  void finish();
  /// A whole answer of plain text, in place of everything that was not sent yet, and its end. Where bytes
  /// have left already the answer fails.
  void refuse(int status, std::string_view text, std::vector<Field> fields = {});

  // The sending thread's side.
  /// Suspends the connection until there is something to send. False: the answer was cut before.
  bool hold(MHD_Connection* connection);
  /// Queues the response, once the connection was resumed. `closes`: it is the connection's last.
  MHD_Result respond(bool closes);
  /// Moves what is there to `buffer`: as MHD's content readers answer.
  ssize_t take(char* buffer, std::size_t size);
  /// The request is over: the connection is not touched from now on.
  void gone();

  // Anybody's.
  /// Sends what was written, though it is little.
  void flush();
  /// Nothing more will reach the client; the connection ends.
  void cut();
  [[nodiscard]] bool isCut() const;
  /// Cuts it if the client has taken nothing for the stall time. True: it did.
  bool cutIfStalled(Clock::time_point now);

 private:
  bool refuseTooLarge(std::size_t more);
  bool countWhole(std::size_t more);
  bool waitForSpace(std::unique_lock<std::mutex>& lock);
  void append(std::string_view bytes);
  void wake();
  void cutLocked();
  void clear();
  MHD_Response* wholeResponse();
  MHD_Response* streamedResponse();
  MHD_Response* readResponse(std::uint64_t size);
  void addFields(MHD_Response* response, bool closes);
  ssize_t endOfStream();

  const ExchangeParts& parts_;
  mutable std::mutex mutex_;
  std::condition_variable space_;
  MHD_Connection* connection_ = nullptr;
  MHD_Response* response_ = nullptr;  ///< owned by the connection, while it is being sent
  bool suspended_ = false;
  bool begun_ = false;
  bool out_ = false;    ///< the connection was woken for the head: the status cannot change
  bool ended_ = false;  ///< nothing more is written
  bool failed_ = false;
  bool cut_ = false;
  bool streams_ = false;  ///< the response is sent without knowing its end
  bool flushing_ = false;
  int status_ = 0;
  std::vector<Field> fields_;
  std::vector<Field> trailers_;
  std::deque<std::string> pieces_;
  std::size_t taken_ = 0;    ///< bytes of the first piece that were taken
  std::size_t queued_ = 0;   ///< bytes that wait
  std::size_t counted_ = 0;  ///< of them, among all whole answers
  Clock::time_point lastTaken_;
};

/// Sees to it that small pieces leave soon, without waking the sending thread for each.
class Flusher {
 public:
  Flusher(Timer& timer, std::chrono::milliseconds delay) : timer_(timer), delay_(delay) {}
  void add(std::weak_ptr<Exchange> exchange);

 private:
  void run();

  Timer& timer_;
  const std::chrono::milliseconds delay_;
  std::mutex mutex_;
  std::vector<std::weak_ptr<Exchange>> waiting_;
};

}  // namespace cimom::http
