// The probe on ICU's streams and bundles: linked into a program, it marks every call of these
// functions in the open Recording by the function's name, such as "u_fopen", and passes it on.

#include "support/recording_host.h"

#include <dlfcn.h>
#include <unicode/ucnv.h>
#include <unicode/ures.h>
#include <unicode/ustdio.h>

// ICU's exported names carry its version.
#define TEXT_OF(symbol) #symbol
#define NAME_OF(symbol) TEXT_OF(symbol)

#define WATCH(Result, function, parameters, arguments)                                             \
  extern "C" Result function parameters {                                                          \
    static const auto original =                                                                   \
        reinterpret_cast<decltype(&function)>(dlsym(RTLD_NEXT, NAME_OF(function)));                \
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
WATCH(void, u_fflush, (UFILE * file), (file))
WATCH(void, u_frewind, (UFILE * file), (file))
WATCH(const char *, ucnv_detectUnicodeSignature,
      (const char *source, int32_t length, int32_t *signatureLength, UErrorCode *error),
      (source, length, signatureLength, error))
WATCH(UResourceBundle *, ures_open, (const char *package, const char *locale, UErrorCode *error),
      (package, locale, error))
WATCH(void, ures_close, (UResourceBundle * bundle), (bundle))
WATCH(const UChar *, ures_getStringByKey,
      (const UResourceBundle *bundle, const char *key, int32_t *length, UErrorCode *error),
      (bundle, key, length, error))
