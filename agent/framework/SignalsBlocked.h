// Threads of the framework inside a process that is not its own.
#pragma once

#include <csignal>

#include <pthread.h>

namespace agent {

/// Blocks all signals of this thread while it lives. A thread that is started meanwhile inherits that for
/// good, so that the signals of the process go on to be handled by threads of its own.
class SignalsBlocked {
 public:
  SignalsBlocked() {
    sigset_t all;
    sigfillset(&all);
    pthread_sigmask(SIG_SETMASK, &all, &before_);
  }
  SignalsBlocked(const SignalsBlocked&) = delete;
  SignalsBlocked& operator=(const SignalsBlocked&) = delete;
  ~SignalsBlocked() { pthread_sigmask(SIG_SETMASK, &before_, nullptr); }

 private:
  sigset_t before_{};
};

}  // namespace agent
