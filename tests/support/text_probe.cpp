// The probe on ICU's collators, names and case mapping: opens and closes of collators are marked as
// "+ucol", "-ucol", and support::FailingConversion can name these functions too.

#include "support/icu_probe.h"
#include "support/recording_host.h"

#include <unicode/ucnv.h>
#include <unicode/ucol.h>
#include <unicode/ustring.h>

namespace {

UCollator *marked(UCollator *collator, const char *line) {
  if (collator != nullptr) {
    support::mark(line);
  }
  return collator;
}

} // namespace

PROBE(UCollator *, ucol_open, (const char *locale, UErrorCode *error),
      marked(original(locale, error), "+ucol"), nullptr)

extern "C" void ucol_close(UCollator *collator) {
  static const auto original = NEXT(ucol_close);
  original(marked(collator, "-ucol"));
}

PROBE(const char *, ucnv_getName, (const UConverter *converter, UErrorCode *error),
      original(converter, error), nullptr)

PROBE(int32_t, u_strToUpper,
      (UChar * dest, int32_t capacity, const UChar *source, int32_t length, const char *locale,
       UErrorCode *error),
      original(dest, capacity, source, length, locale, error), 0)

PROBE(int32_t, u_strToLower,
      (UChar * dest, int32_t capacity, const UChar *source, int32_t length, const char *locale,
       UErrorCode *error),
      original(dest, capacity, source, length, locale, error), 0)

PROBE(int32_t, u_strFoldCase,
      (UChar * dest, int32_t capacity, const UChar *source, int32_t length, uint32_t options,
       UErrorCode *error),
      original(dest, capacity, source, length, options, error), 0)
