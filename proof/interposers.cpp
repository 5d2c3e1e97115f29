// Definitions of the heap's and ICU's functions that come before the libraries' own.

#include "interposers.h"

#include <algorithm>
#include <atomic>
#include <cerrno>
#include <cstdlib>
#include <cstring>
#include <dlfcn.h>
#include <link.h>
#include <type_traits>
#include <unicode/uclean.h>
#include <unicode/ucnv.h>
#include <unicode/ucol.h>
#include <unicode/uloc.h>
#include <unicode/ures.h>
#include <unicode/ustdio.h>
#include <unicode/ustring.h>

namespace interpose {

namespace {

// A few addresses. When it is full, more are not counted.
class Ledger {
public:
  void add(const void *address) { replace(nullptr, address); }
  void remove(const void *address) { replace(address, nullptr); }
  long count() const {
    return std::count_if(std::begin(held_), std::end(held_),
                         [](const auto &place) { return place != nullptr; });
  }

private:
  void replace(const void *address, const void *by) {
    for (std::atomic<const void *> &place : held_) {
      const void *expected = address;
      if (address != by && place == address && place.compare_exchange_strong(expected, by)) {
        return;
      }
    }
  }

  std::atomic<const void *> held_[64];
};
Ledger blocks;
Ledger handles;

struct {
  uintptr_t begin;
  uintptr_t end;
} code;

int findCode(dl_phdr_info *info, size_t /*size*/, void * /*unused*/) {
  for (int i = 0; std::strstr(info->dlpi_name, "libzelnls2") != nullptr && i < info->dlpi_phnum;
       ++i) {
    const auto &segment = info->dlpi_phdr[i];
    if (segment.p_type == PT_LOAD && (segment.p_flags & PF_X) != 0) {
      code.begin = info->dlpi_addr + segment.p_vaddr;
      code.end = code.begin + segment.p_memsz;
    }
  }
  return 0;
}

__attribute__((constructor)) void start() { dl_iterate_phdr(findCode, nullptr); }

template <class Result>
constexpr bool isHandle =
    std::is_same_v<Result, UConverter *> || std::is_same_v<Result, UFILE *> ||
    std::is_same_v<Result, UCollator *> || std::is_same_v<Result, UResourceBundle *>;

template <class Result>
Result taken(const Call &call, Result result) {
  if constexpr (isHandle<Result>) {
    handles.add(result);
    opened(result);
  } else if (isLibrarys(call.caller)) {
    blocks.add(result);
  }
  return result;
}

// Calls ICU's function, unless it is to fail. After a failure ICU's functions do nothing.
template <class Original>
auto passedOn(const Call &call, UErrorCode *error, Original original) {
  using Result = decltype(original());
  if (U_SUCCESS(*error) && refuses(call, error)) {
    return Result();
  }
  if constexpr (isHandle<Result>) {
    return taken(call, original());
  } else {
    return original();
  }
}

[[maybe_unused]] bool refusesBlock(const Call &call) {
  const bool isRefused = refuses(call, nullptr);
  errno = isRefused ? ENOMEM : errno;
  return isRefused;
}

} // namespace

bool isLibrarys(const void *caller) {
  const auto at = reinterpret_cast<uintptr_t>(caller);
  return at >= code.begin && at < code.end;
}

Held held() { return {blocks.count(), handles.count()}; }

} // namespace interpose

using interpose::Call;

#pragma GCC visibility push(default)

#define CALLER __builtin_return_address(0)
#define TEXT_OF(symbol) #symbol
#define NAME_OF(symbol) TEXT_OF(symbol) // ICU's exported names carry its version
#define ORIGINAL(function)                                                                         \
  static const auto original =                                                                     \
      reinterpret_cast<decltype(&(function))>(dlsym(RTLD_NEXT, NAME_OF(function)));

#define ICU(Result, function, parameters, arguments)                                               \
  extern "C" Result function parameters {                                                          \
    ORIGINAL(function)                                                                             \
    return interpose::passedOn({#function, 0, CALLER}, error, [&] { return original arguments; }); \
  }
#define CLOSING(function, Handle)                                                                  \
  extern "C" void function(Handle handle) {                                                        \
    ORIGINAL(function)                                                                             \
    interpose::handles.remove(handle);                                                             \
    original(handle);                                                                              \
  }

// clang-format off
ICU(UConverter *, ucnv_open, (const char *name, UErrorCode *error), (name, error))
ICU(UConverter *, ucnv_openCCSID, (int32_t number, UConverterPlatform platform, UErrorCode *error), (number, platform, error))
ICU(UCollator *, ucol_open, (const char *locale, UErrorCode *error), (locale, error))
ICU(UResourceBundle *, ures_open, (const char *package, const char *locale, UErrorCode *error), (package, locale, error))
CLOSING(ucnv_close, UConverter *)
CLOSING(ucol_close, UCollator *)
CLOSING(ures_close, UResourceBundle *)
CLOSING(u_fclose, UFILE *)
ICU(void, u_init, (UErrorCode *error), (error))
ICU(int32_t, ucnv_getCCSID, (const UConverter *with, UErrorCode *error), (with, error))
ICU(const char *, ucnv_getName, (const UConverter *with, UErrorCode *error), (with, error))
ICU(int32_t, ucnv_toUChars, (UConverter *with, UChar *to, int32_t room, const char *from, int32_t length, UErrorCode *error),
    (with, to, room, from, length, error))
ICU(int32_t, ucnv_fromUChars, (UConverter *with, char *to, int32_t room, const UChar *from, int32_t length, UErrorCode *error),
    (with, to, room, from, length, error))
ICU(int32_t, ucnv_convert, (const char *toName, const char *fromName, char *to, int32_t room, const char *from, int32_t length, UErrorCode *error),
    (toName, fromName, to, room, from, length, error))
ICU(void, ucnv_convertEx, (UConverter *toWith, UConverter *fromWith, char **to, const char *toEnd, const char **from, const char *fromEnd,
                           UChar *pivot, UChar **pivotSource, UChar **pivotTarget, const UChar *pivotEnd, UBool reset, UBool flush, UErrorCode *error),
    (toWith, fromWith, to, toEnd, from, fromEnd, pivot, pivotSource, pivotTarget, pivotEnd, reset, flush, error))
ICU(void, ucnv_toUnicode, (UConverter *with, UChar **to, const UChar *toEnd, const char **from, const char *fromEnd, int32_t *offsets, UBool flush, UErrorCode *error),
    (with, to, toEnd, from, fromEnd, offsets, flush, error))
ICU(void, ucnv_fromUnicode, (UConverter *with, char **to, const char *toEnd, const UChar **from, const UChar *fromEnd, int32_t *offsets, UBool flush, UErrorCode *error),
    (with, to, toEnd, from, fromEnd, offsets, flush, error))
ICU(const char *, ucnv_detectUnicodeSignature, (const char *from, int32_t length, int32_t *found, UErrorCode *error), (from, length, found, error))
ICU(int32_t, uloc_getBaseName, (const char *name, char *to, int32_t room, UErrorCode *error), (name, to, room, error))
ICU(int32_t, uloc_getLanguage, (const char *name, char *to, int32_t room, UErrorCode *error), (name, to, room, error))
ICU(int32_t, u_strToUpper, (UChar *to, int32_t room, const UChar *from, int32_t length, const char *locale, UErrorCode *error),
    (to, room, from, length, locale, error))
ICU(int32_t, u_strToLower, (UChar *to, int32_t room, const UChar *from, int32_t length, const char *locale, UErrorCode *error),
    (to, room, from, length, locale, error))
ICU(int32_t, u_strFoldCase, (UChar *to, int32_t room, const UChar *from, int32_t length, uint32_t options, UErrorCode *error),
    (to, room, from, length, options, error))
ICU(const UChar *, ures_getStringByKey, (const UResourceBundle *in, const char *key, int32_t *length, UErrorCode *error), (in, key, length, error))
// clang-format on

// It has no status.
extern "C" UFILE *u_fopen(const char *name, const char *mode, const char *locale,
                          const char *encoding) {
  ORIGINAL(u_fopen)
  UErrorCode error = U_ZERO_ERROR;
  return interpose::passedOn({"u_fopen", 0, CALLER}, &error,
                             [&] { return original(name, mode, locale, encoding); });
}

#if !defined(__SANITIZE_ADDRESS__) && !defined(__SANITIZE_THREAD__) && !defined(FOREIGN_HEAP)
// libc's other names for them: dlsym itself may allocate.
// NOLINTBEGIN(bugprone-reserved-identifier,readability-identifier-naming)
extern "C" void *__libc_malloc(size_t size) noexcept;
extern "C" void *__libc_calloc(size_t count, size_t size) noexcept;
extern "C" void *__libc_realloc(void *block, size_t size) noexcept;
extern "C" void *__libc_memalign(size_t alignment, size_t size) noexcept;
extern "C" void __libc_free(void *block) noexcept;
// NOLINTEND(bugprone-reserved-identifier,readability-identifier-naming)

#define HEAP(function, bytes, refused, block)                                                      \
  const Call call = {#function, bytes, CALLER};                                                    \
  return interpose::refusesBlock(call) ? (refused) : (block);

extern "C" void *malloc(size_t size) noexcept {
  HEAP(malloc, size, nullptr, interpose::taken(call, __libc_malloc(size)))
}
extern "C" void *calloc(size_t count, size_t size) noexcept {
  HEAP(calloc, count * size, nullptr, interpose::taken(call, __libc_calloc(count, size)))
}
extern "C" void *realloc(void *old, size_t size) noexcept {
  const Call call = {"realloc", size, CALLER};
  if (interpose::refusesBlock(call)) {
    return nullptr;
  }
  void *block = __libc_realloc(old, size);
  if (block != nullptr) {
    interpose::blocks.remove(old);
  }
  return interpose::taken(call, block);
}
extern "C" void *aligned_alloc(size_t alignment, size_t size) noexcept {
  HEAP(aligned_alloc, size, nullptr, __libc_memalign(alignment, size))
}
extern "C" int posix_memalign(void **block, size_t alignment, size_t size) noexcept {
  HEAP(posix_memalign, size, ENOMEM,
       (*block = __libc_memalign(alignment, size)) != nullptr ? 0 : ENOMEM)
}
extern "C" void free(void *block) noexcept {
  interpose::blocks.remove(block);
  __libc_free(block);
}
#endif
