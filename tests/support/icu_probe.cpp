// The probe on ICU's converters.

#include "support/icu_probe.h"

#include "support/recording_host.h"

#include <atomic>
#include <string>
#include <unicode/ucnv.h>

namespace {

std::atomic<int> open{0};
std::atomic<bool> marking{false};

std::string failingFunction;
int callsToFailure = 0;
UErrorCode failure = U_ZERO_ERROR;

void count(int change, const char *line) {
  open += change;
  if (marking) {
    support::mark(line);
  }
}

UConverter *counted(UConverter *converter) {
  if (converter != nullptr) {
    count(1, "+ucnv");
  }
  return converter;
}

} // namespace

namespace support {

int openConverters() { return open; }

ConverterMarks::ConverterMarks() { marking = true; }
ConverterMarks::~ConverterMarks() { marking = false; }

FailingConversion::FailingConversion(const char *function, int call, UErrorCode error) {
  failingFunction = function;
  callsToFailure = call;
  failure = error;
}
FailingConversion::~FailingConversion() { failingFunction.clear(); }

bool refuse(const char *function, UErrorCode *error) {
  if (function != failingFunction || --callsToFailure != 0) {
    return false;
  }
  *error = failure;
  return true;
}

} // namespace support

PROBE(UConverter *, ucnv_open, (const char *name, UErrorCode *error),
      counted(original(name, error)), nullptr)

PROBE(UConverter *, ucnv_openCCSID, (int32_t ccsid, UConverterPlatform platform, UErrorCode *error),
      counted(original(ccsid, platform, error)), nullptr)

PROBE(int32_t, ucnv_toUChars,
      (UConverter * converter, UChar *dest, int32_t capacity, const char *source, int32_t length,
       UErrorCode *error),
      original(converter, dest, capacity, source, length, error), 0)

PROBE(int32_t, ucnv_fromUChars,
      (UConverter * converter, char *dest, int32_t capacity, const UChar *source, int32_t length,
       UErrorCode *error),
      original(converter, dest, capacity, source, length, error), 0)

PROBE(void, ucnv_convertEx,
      (UConverter * to, UConverter *from, char **target, const char *targetLimit,
       const char **source, const char *sourceLimit, UChar *pivot, UChar **pivotSource,
       UChar **pivotTarget, const UChar *pivotLimit, UBool reset, UBool flush, UErrorCode *error),
      original(to, from, target, targetLimit, source, sourceLimit, pivot, pivotSource, pivotTarget,
               pivotLimit, reset, flush, error),
      void())

extern "C" void ucnv_close(UConverter *converter) {
  static const auto original = NEXT(ucnv_close);
  if (converter != nullptr) {
    count(-1, "-ucnv");
  }
  original(converter);
}
