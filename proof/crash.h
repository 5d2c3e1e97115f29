// Where a program crashed.
#pragma once

#include <csignal>
#include <cstring>
#include <dlfcn.h>
#include <execinfo.h>
#include <initializer_list>

namespace proof {

// For a signal handler: the call of ICU's that crashed, the outermost one; without one, "the program".
inline const char *crashedCall() {
  void *frames[64];
  const int count = backtrace(frames, 64);
  const char *call = nullptr;
  for (int i = 2; i < count; ++i) {
    Dl_info info{};
    const bool isIcus =
        dladdr(frames[i], &info) != 0 && std::strstr(info.dli_fname, "libicu") != nullptr;
    if (!isIcus && call != nullptr) {
      break;
    }
    if (isIcus) {
      call = info.dli_sname != nullptr ? info.dli_sname : "?";
    }
  }
  return call != nullptr ? call : "the program";
}

// The handler is called with the signal, and ends with it.
template <void (*report)(const char *call)>
void watchCrashes() {
  void *frame[1];
  backtrace(frame, 1); // loads what it needs
  for (const int signal : {SIGSEGV, SIGABRT, SIGBUS, SIGFPE, SIGILL}) {
    std::signal(signal, [](int number) {
      report(crashedCall());
      std::signal(number, SIG_DFL);
      std::raise(number);
    });
  }
}

} // namespace proof
