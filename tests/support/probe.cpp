// The probe on ICU and the heap. What the library opens, closes and asks of streams and bundles is
// marked in the open Recording as "icu NAME".

#include "support/probe.h"

#include "support/recording_host.h"

#include <algorithm>
#include <atomic>
#include <cstdlib>
#include <cstring>
#include <dlfcn.h>
#include <unicode/uclean.h>
#include <unicode/ucnv.h>
#include <unicode/ucol.h>
#include <unicode/uloc.h>
#include <unicode/ures.h>
#include <unicode/ustdio.h>
#include <unicode/ustring.h>
#include <utility>

namespace support {

World world;

namespace {

std::atomic<int> converters{0};
std::vector<const void *> opened;
std::atomic<void *> blocks[16];

[[maybe_unused]] bool replace(void *block, void *by) {
  return std::any_of(std::begin(blocks), std::end(blocks), [=](std::atomic<void *> &slot) {
    void *expected = block;
    return slot.compare_exchange_strong(expected, by);
  });
}

// Whether this call is one that fails. Sets the error.
bool refuses(const char *function, UErrorCode *error) {
  for (Fault &fault : world.faults) {
    if (fault.function == function && --fault.nth == 0) {
      *error = fault.error;
      return true;
    }
  }
  return false;
}

// ICU's libraries call each other, which is not the library's doing.
bool isLibrarys(const void *caller) {
  Dl_info info{};
  return dladdr(caller, &info) != 0 && std::strstr(info.dli_fname, "libzelnls2") != nullptr;
}

// Marks a call from the place `caller` that has to do with something.
template <class Pointer>
Pointer marked(const void *caller, const char *line, Pointer pointer) {
  if (pointer != nullptr && isRecording() && isLibrarys(caller)) {
    mark(line);
  }
  return pointer;
}

UConverter *counted(const void *caller, UConverter *converter) {
  if (converter != nullptr) {
    ++converters;
    opened.push_back(converter);
  }
  return marked(caller, "icu ucnv_open", converter);
}

const char *textOrNull(const std::string &text) { return text == "null" ? nullptr : text.c_str(); }

} // namespace

int openConverters() { return converters; }

std::vector<const void *> openedConverters() { return std::exchange(opened, {}); }

int openBlocks() {
  return static_cast<int>(std::count_if(std::begin(blocks), std::end(blocks),
                                        [](const auto &slot) { return slot != nullptr; }));
}

} // namespace support

#define CALLER __builtin_return_address(0)
#define TEXT_OF(symbol) #symbol
#define NAME_OF(symbol) TEXT_OF(symbol) // ICU's exported names carry its version
#define PROBE(Result, function, parameters, statement)                                             \
  extern "C" Result function parameters {                                                          \
    static const auto original =                                                                   \
        reinterpret_cast<decltype(&(function))>(dlsym(RTLD_NEXT, NAME_OF(function)));              \
    statement                                                                                      \
  }
// `error` names the parameter for the error.
#define FAILING(Result, function, parameters, refused, passedOn)                                   \
  PROBE(Result, function, parameters,                                                              \
        return support::refuses(#function, error) ? (refused) : (passedOn);)
#define WATCHED(Result, function, parameters, arguments)                                           \
  PROBE(Result, function, parameters, support::marked(CALLER, "icu " #function, CALLER);           \
        return original arguments;)

// clang-format off
FAILING(UConverter *, ucnv_open, (const char *name, UErrorCode *error), nullptr,
        support::counted(CALLER, original(name, error)))
FAILING(UConverter *, ucnv_openCCSID, (int32_t ccsid, UConverterPlatform platform, UErrorCode *error), nullptr,
        support::counted(CALLER, original(ccsid, platform, error)))
PROBE(void, ucnv_close, (UConverter *converter),
      support::converters -= converter != nullptr; original(support::marked(CALLER, "icu ucnv_close", converter));)
FAILING(int32_t, ucnv_getCCSID, (const UConverter *converter, UErrorCode *error), -1, original(converter, error))
FAILING(const char *, ucnv_getName, (const UConverter *converter, UErrorCode *error), nullptr, original(converter, error))
FAILING(int32_t, ucnv_toUChars, (UConverter *converter, UChar *dest, int32_t capacity, const char *source, int32_t length, UErrorCode *error), 0,
        original(converter, dest, capacity, source, length, error))
FAILING(int32_t, ucnv_fromUChars, (UConverter *converter, char *dest, int32_t capacity, const UChar *source, int32_t length, UErrorCode *error), 0,
        original(converter, dest, capacity, source, length, error))
FAILING(void, ucnv_convertEx, (UConverter *to, UConverter *from, char **target, const char *targetLimit, const char **source, const char *sourceLimit,
                               UChar *pivot, UChar **pivotSource, UChar **pivotTarget, const UChar *pivotLimit, UBool reset, UBool flush, UErrorCode *error), void(),
        original(to, from, target, targetLimit, source, sourceLimit, pivot, pivotSource, pivotTarget, pivotLimit, reset, flush, error))
FAILING(UCollator *, ucol_open, (const char *locale, UErrorCode *error), nullptr, support::marked(CALLER, "icu ucol_open", original(locale, error)))
PROBE(void, ucol_close, (UCollator *collator), original(support::marked(CALLER, "icu ucol_close", collator));)
FAILING(int32_t, u_strToUpper, (UChar *dest, int32_t capacity, const UChar *source, int32_t length, const char *locale, UErrorCode *error), 0,
        original(dest, capacity, source, length, locale, error))
FAILING(int32_t, u_strToLower, (UChar *dest, int32_t capacity, const UChar *source, int32_t length, const char *locale, UErrorCode *error), 0,
        original(dest, capacity, source, length, locale, error))
FAILING(int32_t, u_strFoldCase, (UChar *dest, int32_t capacity, const UChar *source, int32_t length, uint32_t options, UErrorCode *error), 0,
        original(dest, capacity, source, length, options, error))
WATCHED(UFILE *, u_fopen, (const char *name, const char *mode, const char *locale, const char *encoding), (name, mode, locale, encoding))
WATCHED(void, u_fclose, (UFILE *file), (file))
WATCHED(void, u_fflush, (UFILE *file), (file))
WATCHED(void, u_frewind, (UFILE *file), (file))
WATCHED(int32_t, u_file_write, (const UChar *text, int32_t length, UFILE *file), (text, length, file))
WATCHED(int32_t, u_file_read, (UChar *text, int32_t length, UFILE *file), (text, length, file))
WATCHED(int32_t, u_fputs, (const UChar *text, UFILE *file), (text, file))
WATCHED(UChar *, u_fgets, (UChar *text, int32_t length, UFILE *file), (text, length, file))
WATCHED(UResourceBundle *, ures_open, (const char *package, const char *locale, UErrorCode *error), (package, locale, error))
WATCHED(void, ures_close, (UResourceBundle *bundle), (bundle))
WATCHED(void, u_init, (UErrorCode *error), (error))
// clang-format on

extern "C" const char *uloc_getDefault() { return support::textOrNull(support::world.locale); }

extern "C" const char *ucnv_getDefaultName() {
  auto &names = support::world.codepages;
  static std::string name;
  name = names.front();
  if (names.size() > 1) {
    names.erase(names.begin());
  }
  return support::textOrNull(name);
}

#if !defined(__SANITIZE_ADDRESS__) && !defined(__SANITIZE_THREAD__) && !defined(FOREIGN_HEAP)
#define HEAP extern "C" __attribute__((visibility("default")))
// Under their other names: dlsym may allocate itself.
// NOLINTBEGIN(bugprone-reserved-identifier,readability-identifier-naming)
extern "C" void *__libc_malloc(std::size_t size) noexcept;
extern "C" void *__libc_realloc(void *block, std::size_t size) noexcept;
extern "C" void __libc_free(void *block) noexcept;
// NOLINTEND(bugprone-reserved-identifier,readability-identifier-naming)

static bool refuses(const char *function, std::size_t size) {
  const auto &faults = support::world.faults;
  return std::any_of(faults.begin(), faults.end(), [=](const support::Fault &fault) {
    return fault.function == function && static_cast<std::size_t>(fault.nth) == size;
  });
}

HEAP void *malloc(std::size_t size) noexcept {
  return refuses("malloc", size) ? nullptr : __libc_malloc(size);
}

HEAP void *realloc(void *block, std::size_t size) noexcept {
  void *const result = refuses("realloc", size) ? nullptr : __libc_realloc(block, size);
  if (block == nullptr && result != nullptr) {
    support::replace(nullptr, result);
  }
  return result;
}

HEAP void free(void *block) noexcept {
  if (block != nullptr) {
    support::replace(block, nullptr);
  }
  __libc_free(block);
}
#endif
