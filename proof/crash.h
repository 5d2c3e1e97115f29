// Where a program crashed.
#pragma once

#include <csignal>
#include <cstring>
#include <dlfcn.h>
#include <execinfo.h>
#include <initializer_list>

namespace proof {

// For signal handlers: the outermost ICU function that was running, or "the program".
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

// Reports a crash; then the signal ends the program as usual.
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
