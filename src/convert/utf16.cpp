// A locale's code page and UTF-16: NLS2_toUTF16, NLS2_fromUTF16.

#include "codepage/locale_converter.h"
#include "locale/registry.h"
#include "nls2.h"
#include "trace/frame.h"

#include <unicode/localpointer.h>
#include <unicode/ucnv.h>

namespace {

using icu::LocalUConverterPointer;
using nls2::trace::Frame;
using nls2::trace::Trace;

// The converter of a live object's code page; null with the status stored where it does not open.
inline UConverter *acquire(Trace trace, const NLS2_Locale *pLocale, int32_t *status) {
  int32_t openStatus = U_ZERO_ERROR;
  UConverter *converter = nls2::codepage::openMapped(pLocale, &openStatus);
  if (openStatus > U_ZERO_ERROR) {
    NLS2_TRACE(trace, "Error %d acquiring converter.", openStatus);
    *status = openStatus;
  }
  return converter;
}

} // namespace

int32_t NLS2_toUTF16(const NLS2_Locale *pLocale, const char *pSource, int32_t sourceLength,
                     UChar *pTarget, int32_t targetLength, int32_t *status) {
  static constinit TRC1_EntryBlock anchor = nls2::trace::anchorOf("NLS2_toUTF16");
  Frame frame(anchor);
  *status = U_ZERO_ERROR;
  if (nls2::locale::validateLocale(pLocale) != U_ZERO_ERROR) {
    NLS2_TRACE(frame, "Invalid locale.");
    *status = NLS2_ERR_INVALID_LOCALE;
    return frame.result(0);
  }
  LocalUConverterPointer converter(acquire(frame, pLocale, status));
  if (converter.isNull()) {
    return frame.result(0);
  }
  UErrorCode error = U_ZERO_ERROR;
  const int32_t length =
      ucnv_toUChars(converter.getAlias(), pTarget, targetLength, pSource, sourceLength, &error);
  if (error > U_ZERO_ERROR) {
    NLS2_TRACE(frame, "Error %d converting string from UTF16.", error);
    *status = error;
    return frame.result(0);
  }
  converter.adoptInstead(nullptr);
  NLS2_TRACE(frame, "Length of output %d.", length);
  return frame.result(length);
}

int32_t NLS2_fromUTF16(const NLS2_Locale *pLocale, const UChar *pSource, int32_t targetLength,
                       char *pTarget, int32_t sourceLength, int32_t *status) {
  static constinit TRC1_EntryBlock anchor = nls2::trace::anchorOf("NLS2_fromUTF16");
  Frame frame(anchor);
  *status = U_ZERO_ERROR;
  if (nls2::locale::validateLocale(pLocale) != U_ZERO_ERROR) {
    *status = NLS2_ERR_INVALID_LOCALE;
    return frame.result(0);
  }
  LocalUConverterPointer converter(acquire(frame, pLocale, status));
  if (converter.isNull()) {
    return frame.result(0);
  }
  UErrorCode error = U_ZERO_ERROR;
  const int32_t length =
      ucnv_fromUChars(converter.getAlias(), pTarget, targetLength, pSource, sourceLength, &error);
  if (error > U_ZERO_ERROR) {
    NLS2_TRACE(frame, "Error %d converting to utf16 .", error);
    *status = error;
    return frame.result(0);
  }
  converter.adoptInstead(nullptr);
  NLS2_TRACE(frame, "Length of output %d.", length);
  return frame.result(length);
}
