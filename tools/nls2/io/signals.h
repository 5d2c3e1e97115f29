// Cleans up when a signal ends the process, and holds signals back.
#pragma once

#include <array>
#include <atomic>
#include <csignal>
#include <unistd.h>

namespace nls2::tool {

// The files to remove; there is room for more than a command ever has. The list changes only while
// signals are held back and the process has one thread.
inline std::array<const char *volatile, 8> namesToRemove{};

inline std::atomic<bool> progressIsShown = false; // a line on the terminal

inline void clearProgress() {
  constexpr char toLineStart[] = {'\r', '\x1B', '[', 'K'};
  if (progressIsShown.exchange(false)) {
    static_cast<void>(!write(STDERR_FILENO, toLineStart, sizeof toLineStart));
  }
}

// Removes the files, then ends the process as the unhandled signal would. Safe in a signal handler.
[[noreturn]] inline void endBySignal(int signal) {
  for (const char *name : namesToRemove) {
    if (name != nullptr) {
      unlink(name);
    }
  }
  clearProgress();
  std::signal(signal, SIG_DFL);
  sigset_t set;
  sigemptyset(&set);
  sigaddset(&set, signal);
  pthread_sigmask(SIG_UNBLOCK, &set, nullptr);
  raise(signal);
  _exit(128 + signal);
}

// Handles the signals that end a process by default and come from other processes or from timers. A
// signal that the caller ignores, as nohup does, stays ignored.
inline void catchEndingSignals() {
  for (const int signal : {SIGHUP, SIGINT, SIGQUIT, SIGTERM, SIGALRM, SIGUSR1, SIGUSR2, SIGXCPU,
                           SIGPIPE, SIGPOLL, SIGVTALRM, SIGPROF, SIGPWR, SIGSTKFLT}) {
    struct sigaction action = {};
    sigaction(signal, nullptr, &action);
    if (action.sa_handler == SIG_DFL) {
      action.sa_handler = endBySignal;
      sigaction(signal, &action, nullptr);
    }
  }
}

class SignalsHeldBack {
public:
  SignalsHeldBack() {
    sigset_t set;
    sigfillset(&set);
    pthread_sigmask(SIG_BLOCK, &set, &before_);
  }
  ~SignalsHeldBack() { pthread_sigmask(SIG_SETMASK, &before_, nullptr); }
  SignalsHeldBack(const SignalsHeldBack &) = delete;
  SignalsHeldBack &operator=(const SignalsHeldBack &) = delete;

private:
  sigset_t before_;
};

} // namespace nls2::tool
