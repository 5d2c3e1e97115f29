// Lets the nth heap request or the nth call of ICU fail in a call of each exported function, for
// every n until a run has no fault: library_faults. Each run is a process of its own, cold (ICU
// has loaded nothing) or warm.
//
// After a fault the outcome must be the usual one or a documented failure with that failure's
// answer, and nothing of the library's may be left behind but what the header calls a leak.

#include "calls.h"
#include "injection.h"

#include <array>
#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <initializer_list>
#include <string_view>
#include <sys/wait.h>
#include <unistd.h>

namespace {

using proof::Call;
using proof::Fault;
using proof::Outcome;

enum ExitCode { noFault = 10, absorbed, reported, wrongAnswer, wrongStatus, leaked };

// The library's own statuses and ICU's.
bool isDocumented(int32_t status) {
  return status < U_ERROR_LIMIT || (status >= 36 && status <= 39) || status == NLS2_ERR_NO_MEMORY;
}

// What the header says of failures that leak.
bool leaksByContract(std::string_view function) {
  return function.starts_with("NLS2_Findstr") || function == "NLS2_GetCodepageId";
}

ExitCode judge(const Call &call, const Outcome &usual, const Outcome &outcome) {
  if (outcome == usual) {
    return absorbed;
  }
  if (outcome.status <= 0) {
    return wrongAnswer;
  }
  return isDocumented(outcome.status) && outcome.answer == call.onFailure ? reported : wrongStatus;
}

NLS2_Locale *makeLocale() {
  int32_t status = 0;
  return NLS2_GetLocale(0x01140002, 819, 0, &status); // German
}

// The outcome without a fault, from a process of its own, so that ICU stays without its data here.
Outcome usualOutcome(const Call &call) {
  std::array<int, 2> ends{};
  if (pipe(ends.data()) != 0) {
    std::perror("pipe");
    std::exit(1);
  }
  if (fork() == 0) {
    const Outcome usual = call.make(makeLocale());
    FILE *out = fdopen(ends[1], "w");
    std::fwrite(&usual.status, sizeof usual.status, 1, out);
    std::fwrite(&usual.answer, sizeof usual.answer, 1, out);
    std::fwrite(usual.bytes.data(), 1, usual.bytes.size(), out);
    std::fclose(out);
    _exit(0);
  }
  close(ends[1]);
  FILE *in = fdopen(ends[0], "r");
  Outcome usual;
  const bool isRead = std::fread(&usual.status, sizeof usual.status, 1, in) == 1 &&
                      std::fread(&usual.answer, sizeof usual.answer, 1, in) == 1;
  for (int byte = 0; isRead && (byte = std::fgetc(in)) != EOF;) {
    usual.bytes += static_cast<char>(byte);
  }
  std::fclose(in);
  while (wait(nullptr) < 0 && errno == EINTR) {
  }
  return usual;
}

// In a process of its own. Never returns.
[[noreturn]] void runOnce(const Call &call, const Outcome &usual, Fault fault, long at, bool warm) {
  alarm(20);
  NLS2_Locale *in = makeLocale();
  if (warm) {
    call.make(in);
  }
  const proof::Left before = proof::left();
  proof::failAt(fault, at);
  Outcome outcome = call.make(in);
  const bool injected = proof::failAt(Fault::none, 0);
  const proof::Left after = proof::left();
  if (!injected) {
    _exit(noFault);
  }
  if (after != before && !leaksByContract(call.function)) {
    std::printf("left behind: %ld blocks, %ld handles\n", after.blocks - before.blocks,
                after.handles - before.handles);
    std::fflush(stdout);
    _exit(leaked);
  }
  const ExitCode code = judge(call, usual, outcome);
  if (code == wrongAnswer || code == wrongStatus) {
    std::printf("status %d, answer %lld, %zu bytes; usually %d, %lld, %zu\n", outcome.status,
                static_cast<long long>(outcome.answer), outcome.bytes.size(), usual.status,
                static_cast<long long>(usual.answer), usual.bytes.size());
    std::fflush(stdout);
  }
  _exit(code);
}

struct Totals {
  long injected = 0;
  long absorbed = 0;
  long reported = 0;
  long crashedInIcu = 0;
  long wrong = 0;
};

int wait(pid_t child) {
  int status = 0;
  while (waitpid(child, &status, 0) < 0 && errno == EINTR) {
  }
  return status;
}

// Until a run without a fault.
void sweep(const Call &call, const Outcome &usual, Fault fault, bool warm, Totals &totals) {
  for (long at = 1;; ++at) {
    const pid_t child = fork();
    if (child == 0) {
      runOnce(call, usual, fault, at, warm);
    }
    const int status = wait(child);
    const int code = WIFEXITED(status) ? WEXITSTATUS(status) : -1;
    if (code == noFault) {
      return;
    }
    ++totals.injected;
    totals.absorbed += code == absorbed ? 1 : 0;
    totals.reported += code == reported ? 1 : 0;
    if (code == absorbed || code == reported) {
      continue;
    }
    if (WIFSIGNALED(status) && proof::crashIsIcus()) {
      ++totals.crashedInIcu;
      continue;
    }
    ++totals.wrong;
    std::printf("WRONG: %s, %s %ld, %s: %s %d\n", call.function, proof::nameOf(fault), at,
                warm ? "warm" : "cold", WIFSIGNALED(status) ? "signal" : "code",
                WIFSIGNALED(status) ? WTERMSIG(status) : code);
  }
}

} // namespace

int main() {
  std::setvbuf(stdout, nullptr, _IOLBF, 0);
  proof::prepareFiles();
  Totals totals;
  for (const Call &call : proof::calls()) {
    const Outcome usual = usualOutcome(call);
    for (const bool warm : {false, true}) {
      for (const Fault fault : {Fault::heap, Fault::icu}) {
        sweep(call, usual, fault, warm, totals);
      }
    }
  }
  proof::removeFiles();
  std::printf("library: %ld faults injected: %ld absorbed, %ld reported, %ld crashed inside ICU, "
              "%ld wrong\n",
              totals.injected, totals.absorbed, totals.reported, totals.crashedInIcu, totals.wrong);
  return totals.wrong == 0 && totals.injected > 400 ? 0 : 1;
}
