// `swinv serve` as a child of the test.
#pragma once

#include "../cli/Process.h"

#include <chrono>
#include <cstdint>
#include <string>
#include <vector>

namespace serve_test {

/// What a test starts a server with besides "serve" and "--log-level trace".
struct ServeStart {
  /// Where none is a "--listen", the server listens at any free port of 127.0.0.1.
  std::vector<std::string> arguments = {"--inventory", cli_test::testFile("examples/server.json")};
  std::map<std::string, std::string> environment = {};
  /// A listening socket that the server is handed as a service manager does, under this name; -1: none.
  int socket = -1;
  std::string socketName = {};
  std::filesystem::path program = SWINV_PROGRAM;
};

class Served {
 public:
  /// Returns when the server listens. Throws `std::runtime_error` with its messages where it ended before.
  explicit Served(const ServeStart& start = {});
  /// Kills what still runs.
  ~Served();
  Served(const Served&) = delete;
  Served& operator=(const Served&) = delete;

  /// What it printed for each listener, without "Listening on ": "http://127.0.0.1:40001".
  [[nodiscard]] const std::vector<std::string>& urls() const { return urls_; }
  [[nodiscard]] std::uint16_t port(std::size_t listener = 0) const;
  [[nodiscard]] int process() const { return process_; }

  /// Standard error so far.
  [[nodiscard]] std::string log() const;
  /// Waits until the log has the text. False: it has not after a minute.
  [[nodiscard]] bool logs(const std::string& text) const;

  void signal(int number) const;
  /// Waits for the end, a minute at most: its exit code, or minus the signal.
  int wait();
  /// SIGTERM, and waits.
  int end();

 private:
  std::string readUrls(std::size_t count);

  int process_ = -1;
  int output_ = -1;
  int error_ = -1;
  std::vector<std::string> urls_;
};

/// A pause between two such tries.
void pauseShortly();

/// Tries until `condition` holds. False: it did not within a minute.
template <typename Condition>
bool eventually(const Condition& condition) {
  const auto end = std::chrono::steady_clock::now() + std::chrono::minutes(1);
  while (!condition()) {
    if (std::chrono::steady_clock::now() > end) {
      return false;
    }
    pauseShortly();
  }
  return true;
}

}  // namespace serve_test
