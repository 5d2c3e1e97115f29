// Preloaded into a program, makes one of its calls fail, or all calls from one on. Counting begins at
// main(), so that the loader and static objects are not affected.
//
//   FAULT_KIND  heap, icu, open, read, write, close, fsync, rename or link
//   FAULT_AT    which call fails, from 1; FAULT_ON=1: that one and all that follow
//   FAULT_HOW   the errno, or 0 for a short count; for icu the status
//   FAULT_LOG   receives "reached" when a fault is injected, and the ICU function that crashed

#include "crash.h"
#include "interposers.h"

#include <atomic>
#include <cerrno>
#include <cstdarg>
#include <cstdlib>
#include <cstring>
#include <fcntl.h>
#include <sys/syscall.h>
#include <unistd.h>

namespace {

std::atomic<long> calls;
long at;
bool goesOn;
int how;
int logFile = -1;
const char *kind = "";
std::atomic<bool> armed;

void say(const char *text) { syscall(SYS_write, logFile, text, std::strlen(text)); }

bool fails(const char *of) {
  if (!armed || std::strcmp(kind, of) != 0) {
    return false;
  }
  const long call = ++calls;
  if (call != at && !(goesOn && call > at)) {
    return false;
  }
  if (call == at) {
    say("reached\n");
  }
  errno = how;
  return true;
}

void onCrash(const char *call) {
  armed = false;
  say("crash in ");
  say(call);
  say("\n");
}

int (*theMain)(int, char **, char **);

int armedMain(int argc, char **argv, char **environment) {
  if (const char *text = std::getenv("FAULT_AT")) {
    at = std::atol(text);
    goesOn = std::getenv("FAULT_ON") != nullptr;
    how = std::atoi(std::getenv("FAULT_HOW"));
    kind = std::getenv("FAULT_KIND");
    logFile = static_cast<int>(syscall(SYS_openat, AT_FDCWD, std::getenv("FAULT_LOG"),
                                       O_WRONLY | O_CREAT | O_TRUNC | O_CLOEXEC, 0644));
    proof::watchCrashes<onCrash>();
    armed = true;
  }
  return theMain(argc, argv, environment);
}

// The next definition of a function.
template <class Function>
Function *next(Function * /*same*/, const char *name) {
  return reinterpret_cast<Function *>(dlsym(RTLD_NEXT, name));
}

} // namespace

bool interpose::refuses(const Call &call, UErrorCode *error) {
  const bool cannotFail = std::strncmp(call.function, "ucnv_get", 8) == 0; // it allocates nothing
  const bool isRefused = !cannotFail && fails(error == nullptr ? "heap" : "icu");
  if (isRefused && error != nullptr) {
    *error = static_cast<UErrorCode>(how);
  }
  return isRefused;
}

void interpose::opened(const void * /*handle*/) {}

#pragma GCC visibility push(default)
extern "C" {

// NOLINTNEXTLINE(bugprone-reserved-identifier,readability-identifier-naming)
int __libc_start_main(int (*program)(int, char **, char **), int argc, char **argv, void (*init)(),
                      void (*fini)(), void (*loader)(), void *stack) {
  theMain = program;
  return next(__libc_start_main, "__libc_start_main")(armedMain, argc, argv, init, fini, loader,
                                                      stack);
}

#define NEXT(function) static const auto original = next(function, #function)

ssize_t read(int file, void *bytes, size_t count) {
  NEXT(read);
  return !fails("read") ? original(file, bytes, count)
         : how == 0     ? original(file, bytes, std::min(count, size_t{1}))
                        : -1;
}

ssize_t write(int file, const void *bytes, size_t count) {
  NEXT(write);
  return !fails("write") ? original(file, bytes, count)
         : how == 0      ? original(file, bytes, std::min(count, size_t{1}))
                         : -1;
}

int close(int file) {
  NEXT(close);
  const bool isRefused = fails("close");
  const int result = original(file);
  errno = isRefused ? how : errno;
  return isRefused ? -1 : result;
}

#define OPENING(name, parameters, arguments)                                                       \
  int name parameters {                                                                            \
    NEXT(name);                                                                                    \
    va_list more;                                                                                  \
    va_start(more, flags);                                                                         \
    const mode_t mode = (flags & (O_CREAT | __O_TMPFILE)) != 0 ? va_arg(more, mode_t) : 0;         \
    va_end(more);                                                                                  \
    return fails("open") ? -1 : original arguments;                                                \
  }
OPENING(open, (const char *path, int flags, ...), (path, flags, mode))
OPENING(open64, (const char *path, int flags, ...), (path, flags, mode))
OPENING(openat, (int folder, const char *path, int flags, ...), (folder, path, flags, mode))

#define FAILING(kind, name, parameters, arguments)                                                 \
  int name parameters {                                                                            \
    NEXT(name);                                                                                    \
    return fails(kind) ? -1 : original arguments;                                                  \
  }
FAILING("fsync", fsync, (int file), (file))
FAILING("fsync", fdatasync, (int file), (file))
FAILING("rename", rename, (const char *from, const char *to), (from, to))
FAILING("link", linkat, (int folder, const char *from, int toFolder, const char *to, int flags),
        (folder, from, toFolder, to, flags))

} // extern "C"
