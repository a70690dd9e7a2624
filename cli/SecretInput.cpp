#include <cli/Messages.h>
#include <cli/SecretInput.h>

#include <cerrno>
#include <csignal>
#include <cstring>
#include <system_error>

#include <fcntl.h>
#include <termios.h>
#include <unistd.h>

namespace cli {
namespace {

constexpr std::size_t longestPassword = 512;

/// Switches the echo of a terminal off while it lives. A signal that would end the process meanwhile is held
/// back until the echo is on again.
class EchoOff {
 public:
  explicit EchoOff(int descriptor) : descriptor_(descriptor) {
    sigset_t ending;
    sigemptyset(&ending);
    for (const int signal : {SIGINT, SIGTERM, SIGHUP, SIGQUIT, SIGTSTP}) {
      sigaddset(&ending, signal);
    }
    pthread_sigmask(SIG_BLOCK, &ending, &signals_);
    isSet_ = tcgetattr(descriptor_, &before_) == 0;
    termios silent = before_;
    silent.c_lflag &= ~static_cast<tcflag_t>(ECHO);
    // Ctrl-C arrives as a character, and ends the line that is read.
    silent.c_lflag &= ~static_cast<tcflag_t>(ISIG);
    isSet_ = isSet_ && tcsetattr(descriptor_, TCSAFLUSH, &silent) == 0;
  }
  ~EchoOff() {
    if (isSet_) {
      tcsetattr(descriptor_, TCSAFLUSH, &before_);
    }
    pthread_sigmask(SIG_SETMASK, &signals_, nullptr);
  }
  EchoOff(const EchoOff&) = delete;
  EchoOff& operator=(const EchoOff&) = delete;

 private:
  int descriptor_;
  bool isSet_ = false;
  termios before_{};
  sigset_t signals_{};
};

void print(int descriptor, std::string_view text) {
  while (!text.empty()) {
    const ssize_t written = write(descriptor, text.data(), text.size());
    if (written <= 0) {
      return;
    }
    text.remove_prefix(static_cast<std::size_t>(written));
  }
}

/// Up to a line break or the end, byte by byte: what stands behind belongs to somebody else.
std::string readLine(int descriptor) {
  constexpr char controlC = '\x03';
  std::string line;
  for (char byte = 0;;) {
    const ssize_t got = read(descriptor, &byte, 1);
    if (got < 0 && errno == EINTR) {
      continue;
    }
    if (got < 0) {
      throw CommandError("the password cannot be read: " + std::generic_category().message(errno));
    }
    if (got == 0 || byte == '\n') {
      return line;
    }
    if (byte == controlC) {
      throw CommandError("interrupted; nothing was changed");
    }
    line.push_back(byte);
    if (line.size() > longestPassword) {
      throw CommandError("the password is longer than " + std::to_string(longestPassword) + " bytes");
    }
  }
}

std::string ask(std::string_view question) {
  print(STDERR_FILENO, question);
  std::string answer;
  {
    const EchoOff echoOff(STDIN_FILENO);
    answer = readLine(STDIN_FILENO);
  }
  print(STDERR_FILENO, "\n");
  return answer;
}

}  // namespace

void wipe(std::string& secret) {
  explicit_bzero(secret.data(), secret.size());
  secret.clear();
}

std::string readNewPassword(std::string_view user) {
  const bool isTerminal = isatty(STDIN_FILENO) == 1;
  std::string password =
      isTerminal ? ask("New password of " + std::string(user) + ": ") : readLine(STDIN_FILENO);
  if (!isTerminal && !password.empty() && password.back() == '\r') {
    password.pop_back();
  }
  if (password.empty()) {
    throw CommandError("the password is empty; nothing was changed");
  }
  if (isTerminal) {
    std::string again = ask("Once more: ");
    const bool isSame = again == password;
    wipe(again);
    if (!isSame) {
      wipe(password);
      throw CommandError("the passwords differ; nothing was changed");
    }
  }
  return password;
}

}  // namespace cli
