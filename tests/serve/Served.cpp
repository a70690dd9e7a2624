#include "Served.h"

#include <algorithm>
#include <array>
#include <csignal>
#include <stdexcept>
#include <thread>
#include <utility>

#include <fcntl.h>
#include <poll.h>
#include <sys/mman.h>
#include <sys/wait.h>
#include <unistd.h>

namespace serve_test {
namespace {

constexpr int startTime = 120000;  // milliseconds; sanitizers and a busy machine are slow

/// A shell stands between: only the process itself knows the number that LISTEN_PID must have.
cli_test::Start handedOver(cli_test::Start start, const ServeStart& wanted) {
  std::string command = "exec 3<&" + std::to_string(wanted.socket) +
                        "; LISTEN_PID=$$ LISTEN_FDS=1 LISTEN_FDNAMES=" + wanted.socketName +
                        " exec \"$0\" \"$@\"";
  std::vector<std::string> arguments{"-c", std::move(command), start.program.string()};
  arguments.insert(arguments.end(), start.arguments.begin(), start.arguments.end());
  start.arguments = std::move(arguments);
  start.program = "/bin/sh";
  return start;
}

std::string contentOf(int descriptor) {
  std::string text;
  std::array<char, 4096> piece{};
  for (ssize_t got = 1; got > 0;) {
    got = pread(descriptor, piece.data(), piece.size(), static_cast<off_t>(text.size()));
    text.append(piece.data(), static_cast<std::size_t>(std::max<ssize_t>(got, 0)));
  }
  return text;
}

}  // namespace

Served::Served(const ServeStart& wanted) : error_(memfd_create("stderr", MFD_CLOEXEC)) {
  std::vector<std::string> arguments{"serve", "--log-level", "trace"};
  arguments.insert(arguments.end(), wanted.arguments.begin(), wanted.arguments.end());
  auto listeners = static_cast<std::size_t>(std::count(arguments.begin(), arguments.end(), "--listen"));
  if (listeners == 0 && wanted.socket < 0) {
    arguments.insert(arguments.end(), {"--listen", "127.0.0.1:0"});
    ++listeners;
  }
  std::array<int, 2> pipe{-1, -1};
  if (pipe2(pipe.data(), O_CLOEXEC) != 0) {
    throw std::runtime_error("no pipe");
  }
  output_ = pipe[0];
  cli_test::Start start{arguments, wanted.environment, wanted.program};
  start.environment.insert({"ORU_LOG", "stderr"});
  if (wanted.socket >= 0) {
    start = handedOver(std::move(start), wanted);
    ++listeners;
  }
  process_ = cli_test::spawn(start, pipe[1], error_);
  close(pipe[1]);
  const std::string printed = readUrls(listeners);
  if (urls_.size() < listeners) {
    kill(process_, SIGKILL);
    const int code = cli_test::exitCodeOf(std::exchange(process_, -1));
    throw std::runtime_error("swinv serve ended with " + std::to_string(code) + ": " + printed + log());
  }
}

Served::~Served() {
  if (process_ > 0) {
    kill(process_, SIGKILL);
    cli_test::exitCodeOf(process_);
  }
  close(output_);
  close(error_);
}

std::string Served::readUrls(std::size_t count) {
  const std::string prefix = "Listening on ";
  std::string text;
  std::array<char, 4096> piece{};
  pollfd ready{output_, POLLIN, 0};
  while (urls_.size() < count && poll(&ready, 1, startTime) == 1) {
    const ssize_t got = read(output_, piece.data(), piece.size());
    if (got <= 0) {
      return text;
    }
    text.append(piece.data(), static_cast<std::size_t>(got));
    urls_.clear();
    for (const std::string& line : cli_test::linesOf(text)) {
      if (line.starts_with(prefix)) {
        urls_.push_back(line.substr(prefix.size()));
      }
    }
  }
  return text;
}

std::uint16_t Served::port(std::size_t listener) const {
  const std::string& url = urls_.at(listener);
  return static_cast<std::uint16_t>(std::stoul(url.substr(url.rfind(':') + 1)));
}

std::string Served::log() const {
  return contentOf(error_);
}

bool Served::logs(const std::string& text) const {
  return eventually([&] { return log().find(text) != std::string::npos; });
}

void Served::signal(int number) const {
  if (kill(process_, number) != 0) {
    throw std::runtime_error("the server has ended: " + log());
  }
}

int Served::wait() {
  int status = 0;
  const bool hasEnded = eventually([&] { return waitpid(process_, &status, WNOHANG) != 0; });
  if (!hasEnded) {
    throw std::runtime_error("the server does not end: " + log());
  }
  process_ = -1;
  return WIFEXITED(status) ? WEXITSTATUS(status) : -WTERMSIG(status);
}

int Served::end() {
  signal(SIGTERM);
  return wait();
}

void pauseShortly() {
  std::this_thread::sleep_for(std::chrono::milliseconds(10));
}

}  // namespace serve_test
