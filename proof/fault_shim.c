/* Preloaded into a program, makes one of its calls fail, or all from one on. Counting begins at
 * main(), so that loaders and libraries start in peace.
 *
 *   FAULT_KIND  heap, icu, open, read, write, close, fsync, rename or link
 *   FAULT_AT    which call fails, from 1; FAULT_ON=1: that one and all that follow
 *   FAULT_HOW   the errno, or 0 for a short count; of icu the status
 *   FAULT_LOG   receives "reached" once a fault was injected, and the call of ICU's that crashed
 */
#define _GNU_SOURCE
#include <dlfcn.h>
#include <errno.h>
#include <execinfo.h>
#include <fcntl.h>
#include <signal.h>
#include <stdarg.h>
#include <stdatomic.h>
#include <stdio.h>
#include <stdlib.h>
#include <string.h>
#include <sys/syscall.h>
#include <unicode/ucnv.h>
#include <unicode/ucol.h>
#include <unicode/ustring.h>
#include <unistd.h>

void *__libc_malloc(size_t size);
void *__libc_calloc(size_t count, size_t size);
void *__libc_realloc(void *block, size_t size);
void *__libc_memalign(size_t alignment, size_t size);

static atomic_long calls;
static long at;
static int on;
static int how;
static int log_file = -1;
static const char *kind = "";
static atomic_int armed;

static void say(const char *text) { syscall(SYS_write, log_file, text, strlen(text)); }

static int fails(const char *of) {
  if (!armed || strcmp(kind, of) != 0) {
    return 0;
  }
  const long call = atomic_fetch_add(&calls, 1) + 1;
  if (call != at && !(on && call > at)) {
    return 0;
  }
  if (call == at) {
    say("reached\n");
  }
  errno = how;
  return 1;
}

static void on_crash(int number) {
  void *frames[64];
  armed = 0;
  const int count = backtrace(frames, 64);
  const char *call = NULL;
  for (int i = 2; i < count; ++i) {
    Dl_info info;
    const int icu = dladdr(frames[i], &info) != 0 && strstr(info.dli_fname, "libicu") != NULL;
    if (!icu && call != NULL) {
      break;
    }
    if (icu) {
      call = info.dli_sname != NULL ? info.dli_sname : "?";
    }
  }
  say("crash in ");
  say(call != NULL ? call : "the program");
  say("\n");
  signal(number, SIG_DFL);
  raise(number);
}

static int (*the_main)(int, char **, char **);

static int armed_main(int argc, char **argv, char **environment) {
  const char *text = getenv("FAULT_AT");
  void *frame[1];
  backtrace(frame, 1); /* loads what it needs */
  if (text != NULL) {
    at = atol(text);
    on = getenv("FAULT_ON") != NULL;
    how = atoi(getenv("FAULT_HOW"));
    kind = getenv("FAULT_KIND");
    log_file = (int)syscall(SYS_openat, AT_FDCWD, getenv("FAULT_LOG"),
                            O_WRONLY | O_CREAT | O_TRUNC | O_CLOEXEC, 0644);
    signal(SIGSEGV, on_crash);
    signal(SIGABRT, on_crash);
    armed = 1;
  }
  return the_main(argc, argv, environment);
}

int __libc_start_main(int (*program)(int, char **, char **), int argc, char **argv,
                      void (*init)(void), void (*fini)(void), void (*loader)(void), void *stack) {
  __typeof__(&__libc_start_main) original =
      (__typeof__(&__libc_start_main))dlsym(RTLD_NEXT, "__libc_start_main");
  the_main = program;
  return original(armed_main, argc, argv, init, fini, loader, stack);
}

void *malloc(size_t size) { return fails("heap") ? NULL : __libc_malloc(size); }
void *calloc(size_t count, size_t size) {
  return fails("heap") ? NULL : __libc_calloc(count, size);
}
void *realloc(void *block, size_t size) {
  return fails("heap") ? NULL : __libc_realloc(block, size);
}
void *aligned_alloc(size_t alignment, size_t size) {
  return fails("heap") ? NULL : __libc_memalign(alignment, size);
}
int posix_memalign(void **block, size_t alignment, size_t size) {
  if (fails("heap")) {
    return ENOMEM;
  }
  *block = __libc_memalign(alignment, size);
  return *block != NULL ? 0 : ENOMEM;
}

/* The next definition of a function; ICU's have a version in their names. */
#define NAME(function) #function
#define NEXT(function)                                                                             \
  static __typeof__(&function) original;                                                           \
  if (original == NULL) {                                                                          \
    original = (__typeof__(&function))dlsym(RTLD_NEXT, NAME(function));                            \
  }

ssize_t read(int file, void *bytes, size_t count) {
  NEXT(read)
  if (fails("read")) {
    return how == 0 && count > 0 ? original(file, bytes, 1) : -1;
  }
  return original(file, bytes, count);
}

ssize_t write(int file, const void *bytes, size_t count) {
  NEXT(write)
  if (fails("write")) {
    return how == 0 && count > 0 ? original(file, bytes, 1) : -1;
  }
  return original(file, bytes, count);
}

int close(int file) {
  NEXT(close)
  if (fails("close")) {
    original(file);
    errno = how;
    return -1;
  }
  return original(file);
}

#define OPENING(name, declared, given)                                                             \
  int name declared {                                                                              \
    NEXT(name)                                                                                     \
    va_list more;                                                                                  \
    va_start(more, flags);                                                                         \
    const mode_t mode = (flags & (O_CREAT | __O_TMPFILE)) != 0 ? va_arg(more, mode_t) : 0;         \
    va_end(more);                                                                                  \
    return fails("open") ? -1 : original given;                                                    \
  }
OPENING(open, (const char *path, int flags, ...), (path, flags, mode))
OPENING(open64, (const char *path, int flags, ...), (path, flags, mode))
OPENING(openat, (int folder, const char *path, int flags, ...), (folder, path, flags, mode))

int fsync(int file) {
  NEXT(fsync)
  return fails("fsync") ? -1 : original(file);
}
int fdatasync(int file) {
  NEXT(fdatasync)
  return fails("fsync") ? -1 : original(file);
}
int rename(const char *from, const char *to) {
  NEXT(rename)
  return fails("rename") ? -1 : original(from, to);
}
int linkat(int folder, const char *from, int to_folder, const char *to, int flags) {
  NEXT(linkat)
  return fails("link") ? -1 : original(folder, from, to_folder, to, flags);
}

#define ICU(type, name, declared, given, failed)                                                   \
  type name declared {                                                                             \
    NEXT(name)                                                                                     \
    if (U_SUCCESS(*status) && fails("icu")) {                                                      \
      *status = (UErrorCode)how;                                                                   \
      return failed;                                                                               \
    }                                                                                              \
    return original given;                                                                         \
  }
ICU(UConverter *, ucnv_open, (const char *page, UErrorCode *status), (page, status), NULL)
ICU(UCollator *, ucol_open, (const char *locale, UErrorCode *status), (locale, status), NULL)
ICU(void, ucnv_toUnicode,
    (UConverter * from, UChar **target, const UChar *limit, const char **source, const char *end,
     int32_t *offsets, UBool flush, UErrorCode *status),
    (from, target, limit, source, end, offsets, flush, status), )
ICU(void, ucnv_fromUnicode,
    (UConverter * to, char **target, const char *limit, const UChar **source, const UChar *end,
     int32_t *offsets, UBool flush, UErrorCode *status),
    (to, target, limit, source, end, offsets, flush, status), )
ICU(void, ucnv_convertEx,
    (UConverter * to, UConverter *from, char **target, const char *limit, const char **source,
     const char *end, UChar *pivot, UChar **pivotSource, UChar **pivotTarget,
     const UChar *pivotLimit, UBool reset, UBool flush, UErrorCode *status),
    (to, from, target, limit, source, end, pivot, pivotSource, pivotTarget, pivotLimit, reset,
     flush, status), )
ICU(int32_t, u_strFoldCase,
    (UChar * to, int32_t room, const UChar *from, int32_t length, uint32_t options,
     UErrorCode *status),
    (to, room, from, length, options, status), 0)
