// A locale's code page and UTF-8 between two open converters: NLS2_StringToUnicode,
// NLS2_UnicodeToString.

#include "codepage/locale_converter.h"
#include "locale/registry.h"
#include "nls2.h"
#include "trace/bounded_text.h"
#include "trace/frame.h"
#include "trace/status.h"

#include <algorithm>
#include <cstdint>
#include <unicode/localpointer.h>
#include <unicode/ucnv.h>

namespace {

using icu::LocalUConverterPointer;
using nls2::failed;
using nls2::trace::BoundedText;
using nls2::trace::Frame;
using nls2::trace::low32;

constexpr const char *utf8 = "utf-8";

// What a length says need not lie in the buffer it belongs to, so no pointer arithmetic here: ICU
// compares the addresses and refuses what does not fit.
template <class Pointer>
Pointer limitOf(Pointer start, int32_t length) {
  return reinterpret_cast<Pointer>(reinterpret_cast<std::uintptr_t>(start) +
                                   static_cast<std::uintptr_t>(std::intptr_t{length}));
}

// Converts from the source to the source: the output starts where the input does and may go on to
// dest + dlen. The result is how far the output's end is from the input's.
int32_t convertInPlace(UConverter *targetConverter, UConverter *sourceConverter, char *dest,
                       int32_t dlen, const char *src, int32_t slen, UErrorCode &error) {
  char *output = const_cast<char *>(src);
  const char *input = src;
  ucnv_convertEx(targetConverter, sourceConverter, &output, limitOf(dest, dlen), &input,
                 limitOf(src, slen), nullptr, nullptr, nullptr, nullptr, true, true, &error);
  return static_cast<int32_t>(reinterpret_cast<std::intptr_t>(output) -
                              reinterpret_cast<std::intptr_t>(input));
}

} // namespace

int32_t NLS2_StringToUnicode(const NLS2_Locale *pLocale, char *dest, int32_t dlen, const char *src,
                             int32_t slen, int32_t *status) {
  static constinit TRC1_EntryBlock anchor = nls2::trace::anchorOf("NLS2_StringToUnicode");
  Frame frame(anchor);
  NLS2_TRACE(frame, "Input parameters: pLocale %X, dest %s, dlen %d, src %s, slen2%d.",
             low32(pLocale), BoundedText(dest, std::max(dlen, 0)).c_str(), dlen,
             BoundedText(src, slen).c_str(), slen);
  *status = U_ZERO_ERROR;
  if (failed(nls2::locale::validateLocale(pLocale))) {
    *status = NLS2_ERR_INVALID_LOCALE;
    return frame.result(0);
  }
  UErrorCode error = U_ZERO_ERROR;
  const LocalUConverterPointer codepage(nls2::codepage::openAsCcsid(pLocale, &error));
  if (failed(error)) {
    NLS2_TRACE(frame, "Error opening source code converter. %d", error);
    *status = error;
    return frame.result(0);
  }
  error = U_ZERO_ERROR;
  const LocalUConverterPointer unicode(ucnv_open(utf8, &error));
  if (failed(error)) {
    NLS2_TRACE(frame, "Error opening UTF-8 Converter. %d", error);
    *status = error;
    return frame.result(0);
  }
  error = U_ZERO_ERROR;
  const int32_t distance =
      convertInPlace(unicode.getAlias(), codepage.getAlias(), dest, dlen, src, slen, error);
  if (failed(error)) {
    NLS2_TRACE(frame, "Could not map source codepage id to name. %d", error);
    *status = error;
    return frame.result(0);
  }
  return frame.result(distance);
}

int32_t NLS2_UnicodeToString(const NLS2_Locale *pLocale, char *dest, int32_t dlen, const char *src,
                             int32_t slen, int32_t *status) {
  static constinit TRC1_EntryBlock anchor = nls2::trace::anchorOf("NLS2_UnicodeToString");
  Frame frame(anchor);
  NLS2_TRACE(frame, "Input parameters: pLocale %X, dest %s, dlen %d, src %s, slen %d.",
             low32(pLocale), BoundedText(dest, std::max(dlen, 0)).c_str(), dlen,
             BoundedText(src, slen).c_str(), slen);
  *status = U_ZERO_ERROR;
  if (failed(nls2::locale::validateLocale(pLocale))) {
    *status = NLS2_ERR_INVALID_LOCALE;
    return frame.result(0);
  }
  UErrorCode error = U_ZERO_ERROR;
  const LocalUConverterPointer unicode(ucnv_open(utf8, &error));
  if (failed(error)) {
    *status = error;
    return frame.result(0);
  }
  error = U_ZERO_ERROR;
  const LocalUConverterPointer codepage(nls2::codepage::openAsCcsid(pLocale, &error));
  if (failed(error)) {
    NLS2_TRACE(frame, "Could not open CCSID converter for codepage %d", pLocale->codepage);
    *status = error;
    return frame.result(0);
  }
  error = U_ZERO_ERROR;
  const int32_t distance =
      convertInPlace(codepage.getAlias(), unicode.getAlias(), dest, dlen, src, slen, error);
  if (failed(error)) {
    NLS2_TRACE(frame, "Could not convert source to destination %d", error);
    *status = error;
    return frame.result(0);
  }
  return frame.result(distance);
}
