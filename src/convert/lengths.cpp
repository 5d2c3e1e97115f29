// Lengths and the size ratio of code pages: NLS2_ConversionRatio, NLS2_Strlen, NLS2_ByteLength,
// NLS2_StringToDouble.

#include "codepage/locale_converter.h"
#include "codepage/utf16_text.h"
#include "locale/registry.h"
#include "nls2.h"
#include "trace/frame.h"
#include "trace/status.h"

#include <unicode/localpointer.h>
#include <unicode/ucnv.h>

namespace {

using icu::LocalUConverterPointer;
using nls2::failed;
using nls2::codepage::openMapped;
using nls2::trace::Frame;
using nls2::trace::low32;

// The destination's size if the source's divides it, else the next multiple of the source's.
int32_t ratioOf(int32_t destSize, int32_t sourceSize) {
  const int32_t quotient = destSize / sourceSize;
  return destSize == quotient * sourceSize ? destSize : sourceSize * (quotient + 1);
}

// The length that a UTF-8 lead byte announces. C0 and C1 count as lead bytes; any other byte that
// is not one is a character by itself.
int32_t byteLengthOf(uint8_t first) {
  if (first < 0xC0 || first > 0xF4) {
    return 1;
  }
  return first < 0xE0 ? 2 : first < 0xF0 ? 3 : 4;
}

} // namespace

int32_t NLS2_ConversionRatio(const NLS2_Locale *pDestinationLocale,
                             const NLS2_Locale *pSourceLocale, int32_t *pStatus) {
  static constinit TRC1_EntryBlock anchor = nls2::trace::anchorOf("NLS2_ConversionRatio");
  Frame frame(anchor);
  *pStatus = U_ZERO_ERROR;
  NLS2_TRACE(frame, "Input parameters: pDestinationLocale %X, pSourceLocale %X.",
             low32(pDestinationLocale), low32(pSourceLocale));
  if (failed(nls2::locale::validateLocale(pDestinationLocale)) ||
      failed(nls2::locale::validateLocale(pSourceLocale))) {
    *pStatus = NLS2_ERR_INVALID_LOCALE;
    return frame.result(0);
  }
  if (pDestinationLocale->codepage == pSourceLocale->codepage) {
    NLS2_TRACE(frame, "Source and Destination Codepage are equal, return ratio 1:1");
    return frame.result(1);
  }
  int32_t status = U_ZERO_ERROR;
  LocalUConverterPointer destination(openMapped(pDestinationLocale, &status));
  if (failed(status)) {
    NLS2_TRACE(frame, "Could not map destination codepage id to name. %d", status);
    *pStatus = status;
    return frame.result(1);
  }
  const LocalUConverterPointer source(openMapped(pSourceLocale, &status));
  if (failed(status)) {
    NLS2_TRACE(frame, "Could not map source codepage id to name. %d", status);
    *pStatus = status;
    return frame.result(1);
  }
  const int32_t destSize = ucnv_getMaxCharSize(destination.getAlias());
  const int32_t sourceSize = ucnv_getMaxCharSize(source.getAlias());
  const int32_t ratio = ratioOf(destSize, sourceSize);
  NLS2_TRACE(frame, "Computed ratio is %d.", ratio);
  return frame.result(ratio > 0 ? ratio : 1);
}

int32_t NLS2_Strlen(const NLS2_Locale *pLocale, const char *pString, int32_t /*ignored*/,
                    int32_t *pStatus) {
  static constinit TRC1_EntryBlock anchor = nls2::trace::anchorOf("NLS2_Strlen");
  Frame frame(anchor);
  if (failed(nls2::locale::validateLocale(pLocale))) {
    *pStatus = NLS2_ERR_INVALID_LOCALE;
    return frame.result(0);
  }
  NLS2_TRACE(frame, "Open the code page converter.");
  nls2::codepage::Utf16Text text; // released after the converter
  UErrorCode error = U_ZERO_ERROR;
  const LocalUConverterPointer converter(nls2::codepage::openAsCcsid(pLocale, &error));
  if (failed(error)) {
    NLS2_TRACE(frame, "Error opening converter for codepage %d.", pLocale->codepage);
    *pStatus = error;
    return frame.result(0);
  }
  NLS2_TRACE(frame, "Pre-flight to determine size of output buffer.");
  error = nls2::codepage::measure(text, converter.getAlias(), pString, -1);
  if (failed(error)) {
    NLS2_TRACE(frame, "Error pre-flighting to UChars %d.", error);
    *pStatus = error;
    return frame.result(0);
  }
  if (!nls2::codepage::allocate(text, frame)) {
    NLS2_TRACE(frame, "Error allocating memory");
    *pStatus = NLS2_ERR_NO_MEMORY;
    return frame.result(0);
  }
  error = nls2::codepage::convert(text, converter.getAlias(), pString, -1);
  if (failed(error)) {
    NLS2_TRACE(frame, "Error converting string to UChar %d", error);
    *pStatus = error;
    return frame.result(0);
  }
  return frame.result(text.lengthToNull());
}

int32_t NLS2_ByteLength(const NLS2_Locale *pLocale, const char *pCharacter, int32_t *pStatus) {
  static constinit TRC1_EntryBlock anchor = nls2::trace::anchorOf("NLS2_ByteLength");
  Frame frame(anchor);
  *pStatus = U_ZERO_ERROR;
  NLS2_TRACE(frame, "Input parameters: pLocale %X, pCharacter %X.", low32(pLocale),
             low32(pCharacter));
  if (failed(nls2::locale::validateLocale(pLocale))) {
    NLS2_TRACE(frame, "Invalid locale.");
    *pStatus = NLS2_ERR_INVALID_LOCALE;
    return frame.result(0);
  }
  const int32_t length = byteLengthOf(static_cast<uint8_t>(*pCharacter));
  NLS2_TRACE(frame, "Size of the character is %d.", length);
  return frame.result(length);
}

double NLS2_StringToDouble(const void * /*ignored*/, const void * /*ignored*/) {
  static constinit TRC1_EntryBlock anchor = nls2::trace::anchorOf("NLS2_StringToDouble");
  Frame frame(anchor);
  return frame.result(0);
}
