// A locale's code page and UTF-8 by converter names: NLS2_toUTF8, NLS2_fromUTF8.

#include "codepage/locale_converter.h"
#include "locale/registry.h"
#include "nls2.h"
#include "trace/bounded_text.h"
#include "trace/frame.h"
#include "trace/status.h"

#include <algorithm>
#include <unicode/localpointer.h>
#include <unicode/ucnv.h>

namespace {

using icu::LocalUConverterPointer;
using nls2::failed;
using nls2::trace::BoundedText;
using nls2::trace::Frame;
using nls2::trace::low32;
using nls2::trace::Trace;

constexpr const char *utf8 = "utf-8";

enum class Direction { toUtf8, fromUtf8 };

// One line serves both directions, with the labels of NLS2_toUTF8. An output with a negative
// capacity prints as empty.
template <Direction direction>
void traceInput(Trace trace, const NLS2_Locale *pLocale, const char *second, int32_t third,
                const char *fourth, int32_t fifth) {
  constexpr bool toUtf8 = direction == Direction::toUtf8;
  NLS2_TRACE(
      trace,
      "Input parameters: pLocale %X, pSource %s, sourceLength %d, pTarget %s, targetLength %d.",
      low32(pLocale), BoundedText(second, toUtf8 ? third : std::max(third, 0)).c_str(), third,
      BoundedText(fourth, toUtf8 ? std::max(fifth, 0) : fifth).c_str(), fifth);
}

// The converter opened here only provides its name; ucnv_convert opens its own by that name.
template <Direction direction>
int32_t convertByName(Trace trace, const NLS2_Locale *pLocale, char *target, int32_t targetLength,
                      const char *source, int32_t sourceLength, int32_t *status) {
  constexpr bool toUtf8 = direction == Direction::toUtf8;
  if (failed(nls2::locale::validateLocale(pLocale))) {
    *status = NLS2_ERR_INVALID_LOCALE;
    return 0;
  }
  int32_t openStatus = U_ZERO_ERROR;
  LocalUConverterPointer converter(nls2::codepage::openMapped(pLocale, &openStatus));
  if (failed(openStatus)) {
    if constexpr (toUtf8) {
      NLS2_TRACE(trace, "Error opening converter for CCSID %d.", pLocale->codepage);
    } else {
      NLS2_TRACE(trace, "Error %d acquiring converter.", openStatus);
    }
    *status = openStatus;
    return 0;
  }
  UErrorCode error = U_ZERO_ERROR;
  const char *name = ucnv_getName(converter.getAlias(), &error);
  if constexpr (toUtf8) {
    NLS2_TRACE(trace, "Converter name returned is %s.", nls2::trace::text(name));
  }
  if (failed(error)) {
    NLS2_TRACE(trace, "Error %d acquiring corresponding name of converter.", error);
    *status = error;
    return 0;
  }
  if constexpr (toUtf8) {
    NLS2_TRACE(trace, "Converting source to UTF-8 string.");
  }
  error = U_ZERO_ERROR;
  const int32_t length = ucnv_convert(toUtf8 ? utf8 : name, toUtf8 ? name : utf8, target,
                                      targetLength, source, sourceLength, &error);
  if (failed(error)) {
    if constexpr (toUtf8) {
      NLS2_TRACE(trace, "Error converting string to UTF-8  %d.", error);
    } else {
      NLS2_TRACE(trace, "Error %d converting string from UTF8.", error);
    }
    *status = error;
    return 0;
  }
  converter.adoptInstead(nullptr);
  NLS2_TRACE(trace, "Length of output %d.", length);
  return length;
}

} // namespace

int32_t NLS2_toUTF8(const NLS2_Locale *pLocale, const char *pSource, int32_t sourceLength,
                    char *pTarget, int32_t targetLength, int32_t *status) {
  static constinit TRC1_EntryBlock anchor = nls2::trace::anchorOf("NLS2_toUTF8");
  Frame frame(anchor);
  *status = U_ZERO_ERROR;
  traceInput<Direction::toUtf8>(frame, pLocale, pSource, sourceLength, pTarget, targetLength);
  return frame.result(convertByName<Direction::toUtf8>(frame, pLocale, pTarget, targetLength,
                                                       pSource, sourceLength, status));
}

// Stores a status on failure only, so callers preset it.
int32_t NLS2_fromUTF8(const NLS2_Locale *pLocale, char *pTarget, int32_t targetLength,
                      const char *pSource, int32_t sourceLength, int32_t *status) {
  static constinit TRC1_EntryBlock anchor = nls2::trace::anchorOf("NLS2_fromUTF8");
  Frame frame(anchor);
  traceInput<Direction::fromUtf8>(frame, pLocale, pTarget, targetLength, pSource, sourceLength);
  return frame.result(convertByName<Direction::fromUtf8>(frame, pLocale, pTarget, targetLength,
                                                         pSource, sourceLength, status));
}
