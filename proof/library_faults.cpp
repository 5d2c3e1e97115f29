// Makes the nth heap request or the nth ICU call fail during a call of each exported function, for n = 1,
// 2, ... until no fault occurs: library_faults. Each run is a separate process, cold (ICU has loaded
// nothing yet) or warm.
//
// After a fault the answer must be the usual one or that of a documented failure, and the library may
// leave nothing behind except the leaks that the header documents.

#include "calls.h"
#include "crash.h"
#include "interposers.h"
#include "support/dispatch.h"

#include <array>
#include <cstdio>
#include <cstdlib>
#include <sys/mman.h>
#include <sys/wait.h>
#include <unistd.h>

namespace {

using interpose::Held;
using proof::Call;

enum ExitCode { noFault = 10, absorbed, reported, wrong, leaked };

enum class Kind { none, heap, icu };
Kind armed = Kind::none;
Kind kind = Kind::none; // armed during calls of the library
long toFault = 0;

void arm(bool isBefore) { armed = isBefore ? kind : Kind::none; }

// Where a child process crashed.
char *const crash = static_cast<char *>(
    mmap(nullptr, 64, PROT_READ | PROT_WRITE, MAP_SHARED | MAP_ANONYMOUS, -1, 0));

void onCrash(const char *call) { std::strncpy(crash, call, 63); }

NLS2_Locale *makeLocale() {
  int32_t status = 0;
  return NLS2_GetLocale(0x01140002, 819, 0, &status); // German
}

// Runs in a child process. Never returns.
[[noreturn]] void runOnce(const Call &call, const std::string &usual, Kind of, long at, bool warm) {
  alarm(20);
  NLS2_Locale *in = makeLocale();
  if (warm) {
    call.make(in);
  }
  const Held before = interpose::held();
  kind = of;
  toFault = at;
  const std::string answer = call.make(in);
  kind = Kind::none;
  if (toFault > 0) {
    _exit(noFault);
  }
  const Held after = interpose::held();
  const bool mayLeak =
      call.text.starts_with("NLS2_Findstr") || call.text.starts_with("NLS2_GetCodepageId ");
  if (after != before && !mayLeak) {
    std::printf("left behind: %ld blocks, %ld handles\n", after.blocks - before.blocks,
                after.handles - before.handles);
    std::fflush(stdout);
    _exit(leaked);
  }
  if (answer == usual || call.isFailure(answer)) {
    _exit(answer == usual ? absorbed : reported);
  }
  std::printf("answer %s; usually %s\n", answer.c_str(), usual.c_str());
  std::fflush(stdout);
  _exit(wrong);
}

// The answer without a fault. A child process makes the call, so that ICU stays cold here.
std::string usualAnswer(const Call &call) {
  std::array<int, 2> ends{};
  if (pipe(ends.data()) != 0) {
    std::perror("pipe");
    std::exit(1);
  }
  if (fork() == 0) {
    const std::string usual = call.make(makeLocale());
    _exit(write(ends[1], usual.data(), usual.size()) < 0);
  }
  close(ends[1]);
  std::string usual;
  for (char byte = 0; read(ends[0], &byte, 1) == 1;) {
    usual += byte;
  }
  close(ends[0]);
  wait(nullptr);
  return usual;
}

struct Totals {
  long injected = 0;
  long absorbed = 0;
  long reported = 0;
  long crashedInIcu = 0;
  long wrong = 0;
};

// Until a run without a fault.
void sweep(const Call &call, const std::string &usual, Kind of, bool warm, Totals &totals) {
  for (long at = 1;; ++at) {
    crash[0] = '\0';
    const pid_t child = fork();
    if (child == 0) {
      runOnce(call, usual, of, at, warm);
    }
    int status = 0;
    waitpid(child, &status, 0);
    const int code = WIFEXITED(status) ? WEXITSTATUS(status) : -1;
    if (code == noFault) {
      return;
    }
    ++totals.injected;
    if (code == absorbed || code == reported) {
      ++(code == absorbed ? totals.absorbed : totals.reported);
    } else if (WIFSIGNALED(status) && std::string(crash).starts_with("ucol_open_")) {
      ++totals.crashedInIcu; // its loader does not check every allocation (ICU 72)
    } else {
      ++totals.wrong;
      std::printf("WRONG: %s, %s %ld, %s: %s %d %s\n", call.text.c_str(),
                  of == Kind::heap ? "heap request" : "call of ICU", at, warm ? "warm" : "cold",
                  WIFSIGNALED(status) ? "signal" : "code",
                  WIFSIGNALED(status) ? WTERMSIG(status) : code, crash);
    }
  }
}

} // namespace

bool interpose::refuses(const interpose::Call &call, UErrorCode *error) {
  const bool isHeaps = error == nullptr;
  if (armed != (isHeaps ? Kind::heap : Kind::icu) || (!isHeaps && !isLibrarys(call.caller)) ||
      --toFault != 0) {
    return false;
  }
  if (!isHeaps) {
    *error = U_MEMORY_ALLOCATION_ERROR;
  }
  return true;
}

void interpose::opened(const void * /*handle*/) {}

int main() {
  std::setvbuf(stdout, nullptr, _IOLBF, 0);
  support::aroundCall = arm;
  proof::watchCrashes<onCrash>();
  Totals totals;
  for (const Call &call : proof::calls()) {
    const std::string usual = usualAnswer(call);
    for (const bool warm : {false, true}) {
      for (const Kind of : {Kind::heap, Kind::icu}) {
        sweep(call, usual, of, warm, totals);
      }
    }
  }
  std::printf("library: %ld faults injected: %ld absorbed, %ld reported, %ld crashed inside ICU, "
              "%ld wrong\n",
              totals.injected, totals.absorbed, totals.reported, totals.crashedInIcu, totals.wrong);
  return totals.wrong == 0 && totals.injected > 400 ? 0 : 1;
}
