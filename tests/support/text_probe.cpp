// The probe on ICU's collators, names and case mapping: opens and closes of collators are marked as
// "+ucol", "-ucol", and support::FailingConversion can name these functions too.

#include "support/icu_probe.h"
#include "support/recording_host.h"

#include <dlfcn.h>
#include <unicode/ucnv.h>
#include <unicode/ucol.h>
#include <unicode/ustring.h>

namespace {

template <class Function>
Function next(Function /*type*/, const char *name) {
  return reinterpret_cast<Function>(dlsym(RTLD_NEXT, name));
}

// ICU's exported names carry its version.
#define TEXT_OF(symbol) #symbol
#define NAME_OF(symbol) TEXT_OF(symbol)
#define NEXT(function) next(&function, NAME_OF(function))

} // namespace

extern "C" UCollator *ucol_open(const char *locale, UErrorCode *error) {
  static const auto original = NEXT(ucol_open);
  UCollator *collator = support::refuse("ucol_open", error) ? nullptr : original(locale, error);
  if (collator != nullptr) {
    support::mark("+ucol");
  }
  return collator;
}

extern "C" void ucol_close(UCollator *collator) {
  static const auto original = NEXT(ucol_close);
  if (collator != nullptr) {
    support::mark("-ucol");
  }
  original(collator);
}

extern "C" const char *ucnv_getName(const UConverter *converter, UErrorCode *error) {
  static const auto original = NEXT(ucnv_getName);
  return support::refuse("ucnv_getName", error) ? nullptr : original(converter, error);
}

extern "C" int32_t u_strToUpper(UChar *dest, int32_t capacity, const UChar *source, int32_t length,
                                const char *locale, UErrorCode *error) {
  static const auto original = NEXT(u_strToUpper);
  return support::refuse("u_strToUpper", error)
             ? 0
             : original(dest, capacity, source, length, locale, error);
}

extern "C" int32_t u_strToLower(UChar *dest, int32_t capacity, const UChar *source, int32_t length,
                                const char *locale, UErrorCode *error) {
  static const auto original = NEXT(u_strToLower);
  return support::refuse("u_strToLower", error)
             ? 0
             : original(dest, capacity, source, length, locale, error);
}

extern "C" int32_t u_strFoldCase(UChar *dest, int32_t capacity, const UChar *source, int32_t length,
                                 uint32_t options, UErrorCode *error) {
  static const auto original = NEXT(u_strFoldCase);
  return support::refuse("u_strFoldCase", error)
             ? 0
             : original(dest, capacity, source, length, options, error);
}
