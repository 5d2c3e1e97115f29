// The probe on ICU's streams and bundles, where only a call shows what the library asked of them:
// linked into a program, it marks every call of these functions in the open Recording by the
// function's name, such as "u_fopen", and passes it on.

#include "support/icu_probe.h"
#include "support/recording_host.h"

#include <unicode/ures.h>
#include <unicode/ustdio.h>

#define WATCH(Result, function, parameters, arguments)                                             \
  extern "C" Result function parameters {                                                          \
    static const auto original = NEXT(function);                                                   \
    support::mark(#function);                                                                      \
    return original arguments;                                                                     \
  }

WATCH(UFILE *, u_fopen,
      (const char *filename, const char *permissions, const char *locale, const char *encoding),
      (filename, permissions, locale, encoding))
WATCH(void, u_fclose, (UFILE * file), (file))
WATCH(int32_t, u_file_write, (const UChar *text, int32_t length, UFILE *file), (text, length, file))
WATCH(int32_t, u_file_read, (UChar * text, int32_t length, UFILE *file), (text, length, file))
WATCH(int32_t, u_fputs, (const UChar *text, UFILE *file), (text, file))
WATCH(UChar *, u_fgets, (UChar * text, int32_t length, UFILE *file), (text, length, file))
WATCH(UResourceBundle *, ures_open, (const char *package, const char *locale, UErrorCode *error),
      (package, locale, error))
WATCH(void, ures_close, (UResourceBundle * bundle), (bundle))
