// Faults by interposition, and what is left behind.

#include "injection.h"

#include <algorithm>
#include <cerrno>
#include <csignal>
#include <cstdlib>
#include <cstring>
#include <dlfcn.h>
#include <execinfo.h>
#include <initializer_list>
#include <link.h>
#include <new>
#include <sys/mman.h>
#include <unicode/uclean.h>
#include <unicode/ucnv.h>
#include <unicode/ucol.h>
#include <unicode/uloc.h>
#include <unicode/ures.h>
#include <unicode/ustdio.h>
#include <unicode/ustring.h>
#include <unistd.h>

extern "C" {
void *__libc_malloc(size_t);
void *__libc_calloc(size_t, size_t);
void *__libc_realloc(void *, size_t);
void __libc_free(void *);
}

namespace proof {

namespace {

Fault armed = Fault::none;
long toFault = 0;

// Addresses that are held, few at a time.
class Ledger {
public:
  void add(const void *address) {
    if (address != nullptr && count_ < 4096) {
      held_[count_++] = address;
    }
  }
  void remove(const void *address) {
    const void **end = held_ + count_;
    const void **found = std::find(held_, end, address);
    if (found != end) {
      *found = held_[--count_];
    }
  }
  long count() const { return static_cast<long>(count_); }

private:
  const void *held_[4096];
  size_t count_;
};
Ledger blocks;
Ledger handles;

struct Range {
  uintptr_t begin;
  uintptr_t end;
};
Range library;

int findLibrary(dl_phdr_info *info, size_t /*size*/, void * /*unused*/) {
  for (int i = 0; std::strstr(info->dlpi_name, "libzelnls2") != nullptr && i < info->dlpi_phnum;
       ++i) {
    const auto &segment = info->dlpi_phdr[i];
    if (segment.p_type == PT_LOAD && (segment.p_flags & PF_X) != 0) {
      library.begin = info->dlpi_addr + segment.p_vaddr;
      library.end = library.begin + segment.p_memsz;
    }
  }
  return 0;
}

bool fromLibrary(const void *caller) {
  const auto at = reinterpret_cast<uintptr_t>(caller);
  return at >= library.begin && at < library.end;
}

bool fails(Fault fault) { return armed == fault && --toFault == 0; }

// Shared with the processes that the program forks.
struct Crash {
  char call[64];
};
Crash *crash;

// The call of ICU's that crashed: the outermost frame in ICU that was called from elsewhere.
void onCrash(int signal) {
  void *frames[64];
  const int count = backtrace(frames, 64);
  const char *innermost = nullptr;
  for (int i = 2; i < count; ++i) {
    Dl_info info;
    if (dladdr(frames[i], &info) == 0 || std::strstr(info.dli_fname, "libicu") == nullptr) {
      if (innermost != nullptr) {
        break;
      }
      continue;
    }
    innermost = info.dli_sname != nullptr ? info.dli_sname : "?";
  }
  std::strncpy(crash->call, innermost != nullptr ? innermost : "", sizeof crash->call - 1);
  std::signal(signal, SIG_DFL);
  std::raise(signal);
}

// Before main: where the library is, and a way to say where a crash was.
__attribute__((constructor)) void start() {
  dl_iterate_phdr(findLibrary, nullptr);
  crash = static_cast<Crash *>(
      mmap(nullptr, sizeof(Crash), PROT_READ | PROT_WRITE, MAP_SHARED | MAP_ANONYMOUS, -1, 0));
  void *frame[1];
  backtrace(frame, 1); // loads what it needs
  for (const int signal : {SIGSEGV, SIGABRT, SIGBUS, SIGFPE, SIGILL}) {
    std::signal(signal, onCrash);
  }
}

} // namespace

const char *nameOf(Fault fault) { return fault == Fault::heap ? "heap request" : "call of ICU"; }

bool failAt(Fault fault, long at) {
  const bool reached = armed != Fault::none && toFault <= 0;
  armed = fault;
  toFault = at;
  return reached;
}

Left left() { return {blocks.count(), handles.count()}; }

// ICU's collation loader does not look at every allocation (ICU 72).
bool crashIsIcus() {
  const bool known = std::strncmp(crash->call, "ucol_open_", 10) == 0;
  crash->call[0] = '\0';
  return known;
}

} // namespace proof

using proof::Fault;

#define FROM_LIBRARY proof::fromLibrary(__builtin_return_address(0))

extern "C" void *malloc(size_t size) {
  if (proof::fails(Fault::heap)) {
    errno = ENOMEM;
    return nullptr;
  }
  void *block = __libc_malloc(size);
  if (FROM_LIBRARY) {
    proof::blocks.add(block);
  }
  return block;
}

extern "C" void *calloc(size_t count, size_t size) {
  if (proof::fails(Fault::heap)) {
    errno = ENOMEM;
    return nullptr;
  }
  void *block = __libc_calloc(count, size);
  if (FROM_LIBRARY) {
    proof::blocks.add(block);
  }
  return block;
}

extern "C" void *realloc(void *old, size_t size) {
  if (proof::fails(Fault::heap)) {
    errno = ENOMEM;
    return nullptr;
  }
  void *block = __libc_realloc(old, size);
  if (block != nullptr) {
    proof::blocks.remove(old);
  }
  if (FROM_LIBRARY) {
    proof::blocks.add(block);
  }
  return block;
}

extern "C" void free(void *block) {
  proof::blocks.remove(block);
  __libc_free(block);
}

// The program's own objects are spared; a field translator's ask by the form that may fail.
void *operator new(size_t size) { return __libc_malloc(size); }
void *operator new(size_t size, const std::nothrow_t & /*unused*/) noexcept {
  void *block = proof::fails(Fault::heap) ? nullptr : __libc_malloc(size);
  proof::blocks.add(block);
  return block;
}
void *operator new[](size_t size, const std::nothrow_t &kind) noexcept {
  return operator new(size, kind);
}
void operator delete(void *block) noexcept { free(block); }
void operator delete(void *block, size_t /*size*/) noexcept { free(block); }
void operator delete[](void *block) noexcept { free(block); }
void operator delete[](void *block, size_t /*size*/) noexcept { free(block); }

#define TEXT_OF(symbol) #symbol
#define NAME_OF(symbol) TEXT_OF(symbol)
#define ORIGINAL(function)                                                                         \
  static const auto original =                                                                     \
      reinterpret_cast<decltype(&function)>(dlsym(RTLD_NEXT, NAME_OF(function)))

// A function of ICU's that fails on request when the library calls it. `record` sees the result.
#define FAILING(Result, function, parameters, arguments, record)                                   \
  extern "C" Result function parameters {                                                          \
    ORIGINAL(function);                                                                            \
    if (FROM_LIBRARY && proof::fails(Fault::icu)) {                                                \
      *error = U_MEMORY_ALLOCATION_ERROR;                                                          \
      return {};                                                                                   \
    }                                                                                              \
    Result result = original arguments;                                                            \
    if (FROM_LIBRARY) {                                                                            \
      record;                                                                                      \
    }                                                                                              \
    return result;                                                                                 \
  }
#define HOLD proof::handles.add(result)
#define NOTHING static_cast<void>(0)

// A function that closes what another opened.
#define CLOSING(function, Type)                                                                    \
  extern "C" void function(Type *opened) {                                                         \
    ORIGINAL(function);                                                                            \
    proof::handles.remove(opened);                                                                 \
    original(opened);                                                                              \
  }

FAILING(UConverter *, ucnv_open, (const char *name, UErrorCode *error), (name, error), HOLD)
FAILING(UConverter *, ucnv_openCCSID, (int32_t id, UConverterPlatform of, UErrorCode *error),
        (id, of, error), HOLD)
FAILING(UCollator *, ucol_open, (const char *name, UErrorCode *error), (name, error), HOLD)
FAILING(UResourceBundle *, ures_open, (const char *in, const char *name, UErrorCode *error),
        (in, name, error), HOLD)
CLOSING(ucnv_close, UConverter)
CLOSING(ucol_close, UCollator)
CLOSING(ures_close, UResourceBundle)
CLOSING(u_fclose, UFILE)

FAILING(int32_t, ucnv_toUChars,
        (UConverter * with, UChar *dest, int32_t room, const char *source, int32_t length,
         UErrorCode *error),
        (with, dest, room, source, length, error), NOTHING)
FAILING(int32_t, ucnv_fromUChars,
        (UConverter * with, char *dest, int32_t room, const UChar *source, int32_t length,
         UErrorCode *error),
        (with, dest, room, source, length, error), NOTHING)
FAILING(int32_t, ucnv_convert,
        (const char *to, const char *from, char *dest, int32_t room, const char *source,
         int32_t length, UErrorCode *error),
        (to, from, dest, room, source, length, error), NOTHING)
FAILING(const char *, ucnv_getName, (const UConverter *with, UErrorCode *error), (with, error),
        NOTHING)
FAILING(int32_t, ucnv_getCCSID, (const UConverter *with, UErrorCode *error), (with, error), NOTHING)
FAILING(const char *, ucnv_detectUnicodeSignature,
        (const char *source, int32_t length, int32_t *found, UErrorCode *error),
        (source, length, found, error), NOTHING)
FAILING(int32_t, uloc_getBaseName, (const char *name, char *dest, int32_t room, UErrorCode *error),
        (name, dest, room, error), NOTHING)
FAILING(int32_t, uloc_getLanguage, (const char *name, char *dest, int32_t room, UErrorCode *error),
        (name, dest, room, error), NOTHING)
FAILING(int32_t, u_strToLower,
        (UChar * dest, int32_t room, const UChar *source, int32_t length, const char *locale,
         UErrorCode *error),
        (dest, room, source, length, locale, error), NOTHING)
FAILING(const UChar *, ures_getStringByKey,
        (const UResourceBundle *in, const char *key, int32_t *length, UErrorCode *error),
        (in, key, length, error), NOTHING)

extern "C" UFILE *u_fopen(const char *name, const char *mode, const char *locale,
                          const char *encoding) {
  ORIGINAL(u_fopen);
  if (FROM_LIBRARY && proof::fails(Fault::icu)) {
    return nullptr;
  }
  UFILE *opened = original(name, mode, locale, encoding);
  proof::handles.add(opened);
  return opened;
}

extern "C" void u_init(UErrorCode *error) {
  ORIGINAL(u_init);
  if (FROM_LIBRARY && proof::fails(Fault::icu)) {
    *error = U_MEMORY_ALLOCATION_ERROR;
    return;
  }
  original(error);
}

extern "C" void ucnv_convertEx(UConverter *to, UConverter *from, char **target, const char *end,
                               const char **source, const char *sourceEnd, UChar *pivot,
                               UChar **pivotSource, UChar **pivotTarget, const UChar *pivotEnd,
                               UBool reset, UBool flush, UErrorCode *error) {
  ORIGINAL(ucnv_convertEx);
  if (FROM_LIBRARY && proof::fails(Fault::icu)) {
    *error = U_MEMORY_ALLOCATION_ERROR;
    return;
  }
  original(to, from, target, end, source, sourceEnd, pivot, pivotSource, pivotTarget, pivotEnd,
           reset, flush, error);
}
