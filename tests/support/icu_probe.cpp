// The probe on ICU's converters.

#include "support/icu_probe.h"

#include "support/recording_host.h"

#include <atomic>
#include <dlfcn.h>
#include <string>
#include <unicode/ucnv.h>

namespace {

std::atomic<int> opened{0};
std::atomic<int> closed{0};
std::atomic<bool> marking{false};
std::atomic<int> failure{U_ZERO_ERROR};

std::string failingFunction;
int callsToFailure = 0;
UErrorCode conversionFailure = U_ZERO_ERROR;

template <class Function>
Function next(Function /*type*/, const char *name) {
  return reinterpret_cast<Function>(dlsym(RTLD_NEXT, name));
}

// ICU's exported names carry its version.
#define TEXT_OF(symbol) #symbol
#define NAME_OF(symbol) TEXT_OF(symbol)
#define NEXT(function) next(&(function), NAME_OF(function))

bool refuse(UErrorCode *error) {
  if (failure == U_ZERO_ERROR) {
    return false;
  }
  *error = static_cast<UErrorCode>(failure.load());
  return true;
}

UConverter *count(UConverter *converter) {
  if (converter != nullptr) {
    ++opened;
    if (marking) {
      support::mark("+ucnv");
    }
  }
  return converter;
}

} // namespace

namespace support {

int openConverters() { return opened - closed; }
int closedConverters() { return closed; }

ConverterMarks::ConverterMarks() { marking = true; }
ConverterMarks::~ConverterMarks() { marking = false; }

FailingOpens::FailingOpens(UErrorCode error) { failure = error; }
FailingOpens::~FailingOpens() { failure = U_ZERO_ERROR; }

FailingConversion::FailingConversion(const char *function, int call, UErrorCode error) {
  failingFunction = function;
  callsToFailure = call;
  conversionFailure = error;
}
FailingConversion::~FailingConversion() { failingFunction.clear(); }

bool refuse(const char *function, UErrorCode *error) {
  if (function != failingFunction || --callsToFailure != 0) {
    return false;
  }
  *error = conversionFailure;
  return true;
}

} // namespace support

extern "C" UConverter *ucnv_open(const char *name, UErrorCode *error) {
  static const auto original = NEXT(ucnv_open);
  return refuse(error) || support::refuse("ucnv_open", error) ? nullptr
                                                              : count(original(name, error));
}

extern "C" UConverter *ucnv_openCCSID(int32_t ccsid, UConverterPlatform platform,
                                      UErrorCode *error) {
  static const auto original = NEXT(ucnv_openCCSID);
  return refuse(error) ? nullptr : count(original(ccsid, platform, error));
}

extern "C" int32_t ucnv_toUChars(UConverter *converter, UChar *dest, int32_t capacity,
                                 const char *source, int32_t length, UErrorCode *error) {
  static const auto original = NEXT(ucnv_toUChars);
  return support::refuse("ucnv_toUChars", error)
             ? 0
             : original(converter, dest, capacity, source, length, error);
}

extern "C" int32_t ucnv_fromUChars(UConverter *converter, char *dest, int32_t capacity,
                                   const UChar *source, int32_t length, UErrorCode *error) {
  static const auto original = NEXT(ucnv_fromUChars);
  return support::refuse("ucnv_fromUChars", error)
             ? 0
             : original(converter, dest, capacity, source, length, error);
}

extern "C" void ucnv_close(UConverter *converter) {
  static const auto original = NEXT(ucnv_close);
  if (converter != nullptr) {
    ++closed;
    if (marking) {
      support::mark("-ucnv");
    }
  }
  original(converter);
}

extern "C" void ucnv_convertEx(UConverter *to, UConverter *from, char **target,
                               const char *targetLimit, const char **source,
                               const char *sourceLimit, UChar *pivotStart, UChar **pivotSource,
                               UChar **pivotTarget, const UChar *pivotLimit, UBool reset,
                               UBool flush, UErrorCode *error) {
  static const auto original = NEXT(ucnv_convertEx);
  if (!support::refuse("ucnv_convertEx", error)) {
    original(to, from, target, targetLimit, source, sourceLimit, pivotStart, pivotSource,
             pivotTarget, pivotLimit, reset, flush, error);
  }
}
