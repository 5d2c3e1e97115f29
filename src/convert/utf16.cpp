// A locale's code page and UTF-16: NLS2_toUTF16, NLS2_fromUTF16.

#include "codepage/locale_converter.h"
#include "locale/registry.h"
#include "nls2.h"
#include "trace/frame.h"
#include "trace/status.h"

#include <unicode/localpointer.h>
#include <unicode/ucnv.h>

namespace {

using icu::LocalUConverterPointer;
using nls2::failed;
using nls2::trace::Frame;
using nls2::trace::Trace;

enum class Direction { toUtf16, fromUtf16 };

// `convert` calls ICU with the open converter and returns the length.
template <Direction direction, class Convert>
int32_t throughConverter(Trace trace, const NLS2_Locale *pLocale, int32_t *status,
                         Convert convert) {
  constexpr bool toUtf16 = direction == Direction::toUtf16;
  *status = U_ZERO_ERROR;
  if (failed(nls2::locale::validateLocale(pLocale))) {
    if constexpr (toUtf16) {
      NLS2_TRACE(trace, "Invalid locale.");
    }
    *status = NLS2_ERR_INVALID_LOCALE;
    return 0;
  }
  int32_t openStatus = U_ZERO_ERROR;
  LocalUConverterPointer converter(nls2::codepage::openMapped(pLocale, &openStatus));
  if (failed(openStatus)) {
    NLS2_TRACE(trace, "Error %d acquiring converter.", openStatus);
    *status = openStatus;
    return 0;
  }
  UErrorCode error = U_ZERO_ERROR;
  const int32_t length = convert(converter.getAlias(), &error);
  if (failed(error)) {
    if constexpr (toUtf16) {
      NLS2_TRACE(trace, "Error %d converting string from UTF16.", error);
    } else {
      NLS2_TRACE(trace, "Error %d converting to utf16 .", error);
    }
    *status = error;
    return 0;
  }
  converter.adoptInstead(nullptr);
  NLS2_TRACE(trace, "Length of output %d.", length);
  return length;
}

} // namespace

int32_t NLS2_toUTF16(const NLS2_Locale *pLocale, const char *pSource, int32_t sourceLength,
                     UChar *pTarget, int32_t targetLength, int32_t *status) {
  static constinit TRC1_EntryBlock anchor = nls2::trace::anchorOf("NLS2_toUTF16");
  Frame frame(anchor);
  return frame.result(throughConverter<Direction::toUtf16>(
      frame, pLocale, status, [=](UConverter *converter, UErrorCode *error) {
        return ucnv_toUChars(converter, pTarget, targetLength, pSource, sourceLength, error);
      }));
}

int32_t NLS2_fromUTF16(const NLS2_Locale *pLocale, const UChar *pSource, int32_t targetLength,
                       char *pTarget, int32_t sourceLength, int32_t *status) {
  static constinit TRC1_EntryBlock anchor = nls2::trace::anchorOf("NLS2_fromUTF16");
  Frame frame(anchor);
  return frame.result(throughConverter<Direction::fromUtf16>(
      frame, pLocale, status, [=](UConverter *converter, UErrorCode *error) {
        return ucnv_fromUChars(converter, pTarget, targetLength, pSource, sourceLength, error);
      }));
}
