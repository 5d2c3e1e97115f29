// The probe on what locale objects are made from.

#include "support/default_probe.h"

#include "nls2.h"

#include <cstdlib>
#include <dlfcn.h>
#include <unicode/ucnv.h>
#include <unicode/uloc.h>

namespace {

const support::Answers *answers = nullptr;
size_t codepagesAsked = 0;

template <class Function>
Function next(Function /*type*/, const char *name) {
  return reinterpret_cast<Function>(dlsym(RTLD_NEXT, name));
}

// ICU's exported names carry its version.
#define TEXT_OF(symbol) #symbol
#define NAME_OF(symbol) TEXT_OF(symbol)
#define NEXT(function) next(&(function), NAME_OF(function))

} // namespace

namespace support {

// A heap whose first block of a size has an address that ends in 32 zero bits, as the thread
// sanitizer's has, gives it away here: in a trace it would look like null.
void *firstObject = std::calloc(1, sizeof(NLS2_Locale));

Answering::Answering(const Answers &given) {
  answers = &given;
  codepagesAsked = 0;
}
Answering::~Answering() { answers = nullptr; }

} // namespace support

extern "C" const char *uloc_getDefault() {
  static const auto original = NEXT(uloc_getDefault);
  return answers != nullptr ? answers->locale : original();
}

extern "C" const char *ucnv_getDefaultName() {
  static const auto original = NEXT(ucnv_getDefaultName);
  if (answers == nullptr) {
    return original();
  }
  const auto &names = answers->codepages;
  return codepagesAsked < names.size() ? names[codepagesAsked++] : names.back();
}

extern "C" int32_t ucnv_getCCSID(const UConverter *converter, UErrorCode *error) {
  static const auto original = NEXT(ucnv_getCCSID);
  if (answers == nullptr || answers->ccsidError == U_ZERO_ERROR) {
    return original(converter, error);
  }
  *error = answers->ccsidError;
  return -1;
}

extern "C" const char *ucnv_getName(const UConverter *converter, UErrorCode *error) {
  static const auto original = NEXT(ucnv_getName);
  if (answers == nullptr || (answers->nameError == U_ZERO_ERROR && !answers->noName)) {
    return original(converter, error);
  }
  *error = answers->nameError;
  return nullptr;
}

#if !defined(__SANITIZE_ADDRESS__) && !defined(__SANITIZE_THREAD__)
// Under its other name: dlsym may allocate itself.
// NOLINTNEXTLINE(bugprone-reserved-identifier,readability-identifier-naming)
extern "C" void *__libc_calloc(std::size_t count, std::size_t size) noexcept;

extern "C" __attribute__((visibility("default"))) void *calloc(std::size_t count,
                                                               std::size_t size) noexcept {
  const bool refused =
      answers != nullptr && answers->noObjects && count * size == sizeof(NLS2_Locale);
  return refused ? nullptr : __libc_calloc(count, size);
}
#endif
