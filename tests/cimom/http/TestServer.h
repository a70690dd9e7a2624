// A server on loopback for one test, with its log and times that a test can wait for.
#pragma once

#include <cimom/http/Server.h>
#include <tests/support/HttpClient.h>

#include <chrono>
#include <condition_variable>
#include <functional>
#include <mutex>
#include <string>
#include <vector>

namespace tests {

using cimom::http::Answer;
using cimom::http::Field;
using cimom::http::Handler;
using cimom::http::LogLevel;
using cimom::http::Request;
using cimom::http::Server;
using cimom::http::Settings;

/// Longer than anything takes that will happen at all.
constexpr std::chrono::seconds patience{30};

/// Something that one thread waits for and another brings about.
class Signal {
 public:
  void set() {
    const std::lock_guard lock(mutex_);
    set_ = true;
    changed_.notify_all();
  }
  [[nodiscard]] bool wait(std::chrono::milliseconds time = patience) {
    std::unique_lock lock(mutex_);
    return changed_.wait_for(lock, time, [this] { return set_; });
  }

 private:
  std::mutex mutex_;
  std::condition_variable changed_;
  bool set_ = false;
};

/// Lines of a log, from any thread.
class Log {
 public:
  void add(std::string_view line);
  [[nodiscard]] std::string text();
  /// Waits for a line that has this text in it.
  [[nodiscard]] bool waitFor(std::string_view part);

 private:
  std::mutex mutex_;
  std::condition_variable changed_;
  std::string text_;
};

/// A plain listener on 127.0.0.1; a log; flushes that a test does not have to wait for long.
[[nodiscard]] Settings loopback(Log& log);

/// Waits until the condition holds. False: it did not.
[[nodiscard]] bool eventually(const std::function<bool()>& condition);

/// Begins with 200 and plain text.
void beginText(Answer& answer, std::vector<Field> more = {});

/// Answers with the request's body, or its method and target where there is none.
void echo(const Request& request, Answer& answer);

/// Bytes of which each place can be told from the others.
[[nodiscard]] std::string pattern(std::size_t size);

/// A folder of the test's own, removed at the end.
class Folder {
 public:
  Folder();
  ~Folder();
  Folder(const Folder&) = delete;
  Folder& operator=(const Folder&) = delete;

  [[nodiscard]] std::string path(const std::string& name) const { return path_ + "/" + name; }
  /// Writes a file with this mode and returns its path.
  std::string write(const std::string& name, std::string_view text, unsigned mode = 0600) const;

 private:
  std::string path_;
};

}  // namespace tests
