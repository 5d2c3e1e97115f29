// NLS2_MapString: upper case, lower case and case folding.

#include "codepage/locale_converter.h"
#include "codepage/utf16_text.h"
#include "locale/registry.h"
#include "nls2.h"
#include "trace/frame.h"
#include "trace/status.h"

#include <cstring>
#include <unicode/localpointer.h>
#include <unicode/uchar.h>
#include <unicode/ucnv.h>
#include <unicode/ustring.h>

namespace {

using icu::LocalUConverterPointer;
using nls2::failed;
using nls2::codepage::Utf16Text;
using nls2::trace::Frame;
using nls2::trace::Trace;

// By the exact value of the options; a value that names no mapping leaves the output as it is.
UErrorCode mapCase(Trace trace, const NLS2_Locale *pLocale, const Utf16Text &source,
                   const Utf16Text &mapped, uint32_t options) {
  UErrorCode error = U_ZERO_ERROR;
  UChar *output = mapped.units.get();
  const int32_t capacity = source.length + 1;
  const UChar *input = source.units.get();
  const int32_t length = source.lengthToNull();
  switch (options) {
  case NLS2_MAP_UPPERCASE:
    u_strToUpper(output, capacity, input, length, pLocale->icuLocale, &error);
    break;
  case NLS2_MAP_LOWERCASE:
    u_strToLower(output, capacity, input, length, pLocale->icuLocale, &error);
    break;
  case NLS2_MAP_FOLDCASE:
    u_strFoldCase(output, capacity, input, length, U_FOLD_CASE_DEFAULT, &error);
    break;
  default:
    NLS2_TRACE(trace, "No opiton specified.");
    break;
  }
  return error;
}

} // namespace

int32_t NLS2_MapString(const NLS2_Locale *pLocale, char *dest, int32_t dlen, const char *src,
                       int32_t slen, uint32_t options) {
  static constinit TRC1_EntryBlock anchor = nls2::trace::anchorOf("NLS2_MapString");
  Frame frame(anchor);
  NLS2_TRACE(frame, "Input parameters: pLocale %X, dest %X, dlen %d, src %X, slen %d,options %x.",
             nls2::trace::low32(pLocale), nls2::trace::low32(dest), dlen, nls2::trace::low32(src),
             slen, options);
  if (failed(nls2::locale::validateLocale(pLocale))) {
    return frame.result(int32_t{NLS2_ERR_INVALID_LOCALE});
  }
  Utf16Text text; // released after the converter
  Utf16Text mapped;
  UErrorCode error = U_ZERO_ERROR;
  LocalUConverterPointer converter(nls2::codepage::openAsCcsid(pLocale, &error));
  if (failed(error)) {
    return frame.result(int32_t{error});
  }
  // Unlike elsewhere, the first pass fails if ICU reports an overflow, so only an empty text is
  // ever mapped.
  const auto length = static_cast<int32_t>(std::strlen(src));
  error = U_ZERO_ERROR;
  text.length = ucnv_toUChars(converter.getAlias(), nullptr, 0, src, length, &error);
  if (failed(error)) {
    return frame.result(int32_t{error});
  }
  if (!nls2::codepage::allocate(text, frame)) {
    converter.adoptInstead(nullptr);
    NLS2_TRACE(frame, "Invalid locale.");
    return frame.result(int32_t{NLS2_ERR_NO_MEMORY});
  }
  error = nls2::codepage::convert(text, converter.getAlias(), src, length);
  if (failed(error)) {
    return frame.result(int32_t{error});
  }
  // The output is the mapped text, its terminator and the unit after that.
  mapped.length = text.length + 1;
  if (!nls2::codepage::allocate(mapped, frame)) {
    return frame.result(int32_t{NLS2_ERR_NO_MEMORY});
  }
  std::memset(mapped.units.get(), 0, mapped.size());
  error = mapCase(frame, pLocale, text, mapped, options);
  if (failed(error)) {
    NLS2_TRACE(frame, "Error occurred during mapping %d.", error);
    return frame.result(int32_t{error});
  }
  error = U_ZERO_ERROR;
  const int32_t written = ucnv_fromUChars(converter.getAlias(), dest, dlen, mapped.units.get(),
                                          mapped.length + 1, &error);
  if (failed(error)) {
    NLS2_TRACE(frame, "Error occurred during conversion %d.", error);
    return frame.result(int32_t{error});
  }
  return frame.result(written);
}
