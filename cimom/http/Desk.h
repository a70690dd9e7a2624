// Where requests that have arrived whole are taken to a worker, past the login.
#pragma once

#include <cimom/http/Exchange.h>
#include <cimom/http/Login.h>
#include <cimom/http/Server.h>
#include <cimom/http/Timer.h>
#include <cimom/http/Workers.h>

#include <atomic>
#include <condition_variable>
#include <memory>
#include <mutex>
#include <optional>
#include <string>
#include <unordered_map>

namespace cimom::http {

/// A refusal of the server's own.
struct Refusal {
  int status = 0;
  std::string_view text;
  std::vector<Field> fields;
};

/// Any thread, none of which ever waits in it, but for `waitForNone` and the destructor.
class Desk {
 public:
  /// Throws what `Login` throws.
  Desk(Settings settings, Handler handler);
  ~Desk();
  Desk(const Desk&) = delete;
  Desk& operator=(const Desk&) = delete;

  [[nodiscard]] const Settings& settings() const { return settings_; }
  [[nodiscard]] Login& login() { return login_; }
  [[nodiscard]] Timer& timer() { return timer_; }
  void log(LogLevel level, const std::string& line) const;

  /// A request has begun to arrive, and is over. What began when the doors are shut ends at once: nullptr.
  std::shared_ptr<Exchange> arrive();
  void leave(Exchange& exchange);
  [[nodiscard]] std::size_t underWay() const;

  /// Counts bytes of bodies; false: there are too many.
  bool takeBytes(std::size_t count);
  void returnBytes(std::size_t count) { bytes_ -= count; }

  /// What becomes of a request with neither a certificate nor credentials; nothing where it is served.
  [[nodiscard]] std::optional<Refusal> refusalWithoutLogin(const Request& request) const;

  /// Has the request handled: its user is set, or it needs none.
  void serve(const std::shared_ptr<Exchange>& exchange);
  /// Has the login checked before.
  void serve(const std::shared_ptr<Exchange>& exchange, BasicLogin login, std::string origin);

  /// Answers from now on are the last on their connections.
  void closeSoon() { closing_ = true; }
  [[nodiscard]] bool closes() const { return closing_; }
  bool waitForNone(std::chrono::milliseconds patience);
  /// Cuts every answer, those that begin later too.
  void cutAll();
  /// Cuts the answers whose clients take nothing.
  void cutStalled(Clock::time_point now);
  /// Whether no handler runs any more, after so long at most.
  bool waitForHandlers(std::chrono::milliseconds patience) { return workers_.waitUntilIdle(patience); }

 private:
  void handle(Exchange& exchange);
  void checkInTurn(const std::shared_ptr<Exchange>& exchange, const BasicLogin& login,
                   const std::string& origin);
  void check(const std::shared_ptr<Exchange>& exchange, const BasicLogin& login, const std::string& origin);
  void submit(Workers& workers, const std::shared_ptr<Exchange>& exchange, Workers::Task task);
  [[nodiscard]] bool isOpen(const Request& request) const;
  [[nodiscard]] Refusal unauthorized() const;

  const Settings settings_;
  const Handler handler_;
  Login login_;
  std::atomic<std::size_t> bytes_ = 0;
  std::atomic<std::size_t> wholeBytes_ = 0;
  std::atomic<bool> closing_ = false;
  mutable std::mutex mutex_;
  std::condition_variable none_;
  bool shut_ = false;
  std::unordered_map<Exchange*, std::weak_ptr<Exchange>> exchanges_;
  // What follows is ended in the opposite order: the timer hands out work, and workers use the flusher.
  Timer timer_;
  Flusher flusher_;
  Workers workers_;
  Workers logins_;
  const ExchangeParts parts_;
};

}  // namespace cimom::http
