// NLS2_Strcoll: two strings compared by the rules of a language.

#include "codepage/locale_converter.h"
#include "codepage/utf16_text.h"
#include "locale/registry.h"
#include "nls2.h"
#include "trace/bounded_text.h"
#include "trace/frame.h"
#include "trace/status.h"

#include <cstring>
#include <unicode/localpointer.h>
#include <unicode/uchar.h>
#include <unicode/ucnv.h>
#include <unicode/ucol.h>

namespace {

using icu::LocalUCollatorPointer;
using icu::LocalUConverterPointer;
using nls2::failed;
using nls2::codepage::Utf16Text;
using nls2::trace::BoundedText;
using nls2::trace::Frame;
using nls2::trace::Trace;

// The byte length in whole characters: up to the null if `given` is negative, else up to the end of
// the first character that ends at or after `given`. It wraps at 16 bits. NLS2_ByteLength is called
// twice because both calls are in the known traces. Its status is ignored, since the object is
// live.
int16_t walkedLength(Trace trace, const NLS2_Locale *pLoc, const char *string, int16_t given,
                     int number) {
  if (given < 0) {
    NLS2_TRACE(trace, "Determine length of string %d by looking for null.", number);
  } else {
    NLS2_TRACE(trace, "String %d is not null terminated, search for last character.", number);
  }
  int64_t length = 0;
  while (given < 0 ? string[length] != 0 : length < given) {
    int32_t ignored = U_ZERO_ERROR;
    NLS2_ByteLength(pLoc, string + length, &ignored);
    length += NLS2_ByteLength(pLoc, string + length, &ignored);
  }
  if (given < 0) {
    NLS2_TRACE(trace, "Cumulative byte length determined is %d.", static_cast<int16_t>(length));
  } else {
    NLS2_TRACE(trace, "Cumulative byte length determined to be %d.", static_cast<int16_t>(length));
  }
  return static_cast<int16_t>(length);
}

// Both passes, into a cleared block. If there is no memory for string 2, the converter is closed
// before string 1 is freed.
bool convertString(Trace trace, LocalUConverterPointer &converter, Utf16Text &text,
                   const char *string, int16_t length, int number, int32_t *pStatus) {
  UErrorCode error = nls2::codepage::measure(text, converter.getAlias(), string, length);
  if (failed(error)) {
    if (number == 1) {
      NLS2_TRACE(trace, "Error pre-flighting String 1 to UChars %d", error);
    } else {
      NLS2_TRACE(trace, "Error pre-flighting String 2 to UChars");
    }
    *pStatus = error;
    converter.adoptInstead(nullptr);
    return false;
  }
  if (!nls2::codepage::allocate(text, trace)) {
    NLS2_TRACE(trace, "Error allocating memory");
    *pStatus = NLS2_ERR_NO_MEMORY;
    converter.adoptInstead(nullptr);
    return false;
  }
  std::memset(text.units.get(), 0, text.size());
  error = nls2::codepage::convert(text, converter.getAlias(), string, length);
  if (failed(error)) {
    if (number == 1) {
      NLS2_TRACE(trace, "Error converting String 1 to UChars");
    } else {
      NLS2_TRACE(trace, "Error converting String 2 to UChars %d", error);
    }
    *pStatus = error;
    return false;
  }
  return true;
}

// Turns trailing blanks into nulls, which the collator ignores. The length stays.
void trim(Utf16Text &text) {
  nls2::codepage::clearTrailing(text.units.get(), text.lengthToNull(),
                                [](UChar32 character) { return u_isblank(character) != 0; });
}

int32_t compare(Trace trace, const NLS2_Locale *pLoc, Utf16Text &text1, Utf16Text &text2,
                uint32_t options, int32_t *pStatus) {
  NLS2_TRACE(trace, "Preparing to open collator using locale %s", pLoc->icuLocale);
  UErrorCode error = U_ZERO_ERROR;
  const LocalUCollatorPointer collator(ucol_open(pLoc->icuLocale, &error));
  if (failed(error)) {
    NLS2_TRACE(trace, "Error %d opening collator for locale %s", error, pLoc->icuLocale);
    *pStatus = error;
    return 0;
  }
  NLS2_TRACE(trace, "Setting collation strength to UCOL_TERTIARY.");
  ucol_setStrength(collator.getAlias(), UCOL_TERTIARY);
  if ((options & SORT_IGNORETRAILING) != 0) {
    NLS2_TRACE(trace, "SORT_IGNORETRAILING option specified.");
    NLS2_TRACE(trace, "Remove trailing blanks from String 1 ");
    trim(text1);
    NLS2_TRACE(trace, "Remove trailing blanks from String 2.");
    trim(text2);
  }
  NLS2_TRACE(trace, "Collation ready with dest1Cap %d and dest2Cap %d", text1.length, text2.length);
  const UCollationResult order = ucol_strcoll(collator.getAlias(), text1.units.get(), text1.length,
                                              text2.units.get(), text2.length);
  NLS2_TRACE(trace, "Collator has processed the text buffers with results equal to %d.", order);
  text1.units.reset();
  text2.units.reset();
  return order == UCOL_LESS ? -1 : order == UCOL_GREATER ? 1 : 0;
}

} // namespace

int32_t NLS2_Strcoll(const NLS2_Locale *pLoc, const char *pString1, int16_t String1Length,
                     const char *pString2, int16_t String2Length, uint32_t options,
                     int32_t *pStatus) {
  static constinit TRC1_EntryBlock anchor = nls2::trace::anchorOf("NLS2_Strcoll");
  Frame frame(anchor);
  NLS2_TRACE(frame,
             "Input parameters: pLoc %X, pString1 %s, String1Length %d, pString2 %s, "
             "String2Length %d, options %x.",
             nls2::trace::low32(pLoc), BoundedText(pString1, String1Length).c_str(), String1Length,
             BoundedText(pString2, String2Length).c_str(), String2Length, options);
  *pStatus = U_ZERO_ERROR;
  if ((options & SORT_IGNORETRAILING) != 0) {
    NLS2_TRACE(frame, "SORT_IGNORETRAILING Option specified %X", options);
  }
  if ((options & CHARBASED) != 0) {
    NLS2_TRACE(frame, "CHARBASED Option specified %X", options);
  }
  if (failed(nls2::locale::validateLocale(pLoc))) {
    NLS2_TRACE(frame, "Invalid locale.");
    *pStatus = NLS2_ERR_INVALID_LOCALE;
    return frame.result(0);
  }
  NLS2_TRACE(frame, "Acquire Converter for CodePage %d.", pLoc->codepage);
  int32_t status = U_ZERO_ERROR;
  LocalUConverterPointer converter(nls2::codepage::openMapped(pLoc, &status));
  if (failed(status)) {
    NLS2_TRACE(frame, "Error %d acquiring Converter.", status);
    *pStatus = status;
    return frame.result(0);
  }
  int16_t length1 = String1Length;
  int16_t length2 = String2Length;
  if ((options & CHARBASED) != 0) {
    NLS2_TRACE(frame, "CHARBASED option selected.");
    length1 = walkedLength(frame, pLoc, pString1, length1, 1);
    NLS2_TRACE(frame, "Computing length of string 2");
    length2 = walkedLength(frame, pLoc, pString2, length2, 2);
  }
  Utf16Text text1;
  Utf16Text text2;
  if (!convertString(frame, converter, text1, pString1, length1, 1, pStatus) ||
      !convertString(frame, converter, text2, pString2, length2, 2, pStatus)) {
    return frame.result(0);
  }
  converter.adoptInstead(nullptr);
  return frame.result(compare(frame, pLoc, text1, text2, options, pStatus));
}
