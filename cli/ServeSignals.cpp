#include <cli/ServeSignals.h>

#include <csignal>
#include <initializer_list>

namespace cli {
namespace {

sigset_t setOf(std::initializer_list<int> signals) {
  sigset_t set;
  sigemptyset(&set);
  for (const int signal : signals) {
    sigaddset(&set, signal);
  }
  return set;
}

}  // namespace

ServeSignals::ServeSignals() {
  const sigset_t all = setOf({SIGTERM, SIGINT, SIGHUP});
  pthread_sigmask(SIG_BLOCK, &all, nullptr);
  // nohup(1) has it ignored, and what is ignored does not wait.
  static_cast<void>(std::signal(SIGHUP, SIG_DFL));
}

ServeSignals::~ServeSignals() {
  stopAtOnceFromNow();
}

ServeSignal ServeSignals::next() {
  const sigset_t all = setOf({SIGTERM, SIGINT, SIGHUP});
  int signal = 0;
  while (sigwait(&all, &signal) != 0) {
  }
  return signal == SIGHUP ? ServeSignal::Reload : ServeSignal::Stop;
}

void ServeSignals::stopAtOnceFromNow() {
  const sigset_t ending = setOf({SIGTERM, SIGINT});
  pthread_sigmask(SIG_UNBLOCK, &ending, nullptr);
}

}  // namespace cli
