// What converters do with bytes and characters that do not convert: stop, or replace and count.
#include "translate/replacement.h"

#include <unicode/ucnv_cb.h>
#include <unicode/ucnv_err.h>

namespace zelfields {
namespace {

Replacements &countsIn(const void *context) {
  return *static_cast<Replacements *>(const_cast<void *>(context));
}

// ICU's error remains, and the converter stops.
void stopDecoding(const void *, UConverterToUnicodeArgs *, const char *, int32_t,
                  UConverterCallbackReason, UErrorCode *) {}
void stopEncoding(const void *, UConverterFromUnicodeArgs *, const UChar *, int32_t, UChar32,
                  UConverterCallbackReason, UErrorCode *) {}

void countBytes(const void *context, UConverterToUnicodeArgs *arguments, const char *, int32_t,
                UConverterCallbackReason reason, UErrorCode *error) {
  if (reason <= UCNV_IRREGULAR) {
    Replacements &replaced = countsIn(context);
    ++(replaceBytes(arguments, error) == 0x1A ? replaced.sub : replaced.fffd).invalid;
  }
}

template <bool visibly>
void countCharacter(const void *context, UConverterFromUnicodeArgs *arguments, const UChar *units,
                    int32_t length, UChar32 codePoint, UConverterCallbackReason reason,
                    UErrorCode *error) {
  if (reason > UCNV_IRREGULAR) {
    return;
  }
  Replacements &replaced = countsIn(context);
  ++(codePoint == 0xFFFD ? replaced.fffd.lacking
     : codePoint == 0x1A ? replaced.sub.lacking
                         : replaced.others);
  if constexpr (visibly) {
    *error = U_ZERO_ERROR;
    ucnv_cbFromUWriteSub(arguments, 0, error);
  } else {
    UCNV_FROM_U_CALLBACK_SUBSTITUTE(nullptr, arguments, units, length, codePoint, reason, error);
  }
}

} // namespace

char16_t replaceBytes(UConverterToUnicodeArgs *arguments, UErrorCode *error) {
  UChar units[4] = {};
  UConverterToUnicodeArgs apart = *arguments; // to see what ICU chooses
  apart.target = units;
  apart.targetLimit = units + std::size(units);
  apart.offsets = nullptr;
  *error = U_ZERO_ERROR;
  ucnv_cbToUWriteSub(&apart, 0, error);
  ucnv_cbToUWriteUChars(arguments, units, static_cast<int32_t>(apart.target - units), 0, error);
  return units[0];
}

void setCallbacks(UConverter *from, UConverter *to, int32_t onBad, Replacements *replaced,
                  UErrorCode &error) {
  const bool stops = onBad == NLS2F_STOP;
  ucnv_setToUCallBack(from, stops ? stopDecoding : countBytes, replaced, nullptr, nullptr, &error);
  ucnv_setFromUCallBack(to,
                        stops                            ? stopEncoding
                        : onBad == NLS2F_REPLACE_VISIBLY ? countCharacter<true>
                                                         : countCharacter<false>,
                        replaced, nullptr, nullptr, &error);
}

} // namespace zelfields
