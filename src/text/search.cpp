// NLS2_Findstr: whether one string occurs in another.

#include "codepage/locale_converter.h"
#include "codepage/utf16_text.h"
#include "locale/registry.h"
#include "nls2.h"
#include "trace/bounded_text.h"
#include "trace/frame.h"
#include "trace/status.h"

#include <cstring>
#include <unicode/localpointer.h>
#include <unicode/ucnv.h>
#include <unicode/ustring.h>

namespace {

using icu::LocalUConverterPointer;
using nls2::failed;
using nls2::codepage::Utf16Text;
using nls2::trace::BoundedText;
using nls2::trace::Frame;
using nls2::trace::Trace;

constexpr int32_t searchFailed = -1;

// Everything that a call owns. The known traces show whether it is released before or after a line.
struct Search {
  Trace trace;
  const NLS2_Locale *pLocale;
  LocalUConverterPointer converter{};
  Utf16Text text1{};
  Utf16Text text2{};
  Utf16Text lower1{};
  Utf16Text lower2{};

  void release() {
    text1.units.reset();
    text2.units.reset();
    lower1.units.reset();
    lower2.units.reset();
    converter.adoptInstead(nullptr);
  }

  // Leaks the first string's block if string 2 cannot be measured or allocated: the library always
  // did, and callers that count leaks expect it.
  void releaseAllButText1() {
    converter.adoptInstead(nullptr);
    static_cast<void>(text1.units.release());
  }
};

bool openConverter(Search &search) {
  NLS2_TRACE(search.trace, "Opening converter for codepage %d.", search.pLocale->codepage);
  int32_t status = U_ZERO_ERROR;
  search.converter.adoptInstead(nls2::codepage::openMapped(search.pLocale, &status));
  if (failed(status)) {
    NLS2_TRACE(search.trace, "Could not map Codepage ID %d to Name", search.pLocale->codepage);
    return false;
  }
  NLS2_TRACE(search.trace, "Converter opened.");
  return true;
}

bool convertString1(Search &search, const char *string, int32_t length) {
  const Trace trace = search.trace;
  UConverter *converter = search.converter.getAlias();
  NLS2_TRACE(trace, "Pre-flight string1 to determine size of output needed.");
  UErrorCode error = nls2::codepage::measure(search.text1, converter, string, length);
  if (failed(error)) {
    NLS2_TRACE(trace, "Could not pre-flight first string to UChars");
    return false;
  }
  NLS2_TRACE(trace, "Buffer size of %d bytes needed, allocate memory.", search.text1.length);
  if (!nls2::codepage::allocate(search.text1, trace)) {
    NLS2_TRACE(trace, "Could not allocate memory.");
    return false;
  }
  NLS2_TRACE(trace, "Convert string1 to UChars.");
  error = nls2::codepage::convert(search.text1, converter, string, length);
  if (failed(error)) {
    search.release();
    NLS2_TRACE(trace, "Could convert string1 to UChars %d", error);
    return false;
  }
  return true;
}

bool convertString2(Search &search, const char *string, int32_t length) {
  const Trace trace = search.trace;
  UConverter *converter = search.converter.getAlias();
  NLS2_TRACE(trace, "Pre-flight string2 to determine buffer size needed.");
  UErrorCode error = nls2::codepage::measure(search.text2, converter, string, length);
  if (failed(error)) {
    search.releaseAllButText1();
    NLS2_TRACE(trace, "Could not pre-flight string2 to UChars %d", error);
    return false;
  }
  NLS2_TRACE(trace, "Buffer size %d bytes needed, allocate memory.", search.text2.length);
  if (!nls2::codepage::allocate(search.text2, trace)) {
    search.releaseAllButText1();
    NLS2_TRACE(trace, "Could not allocate memory.");
    return false;
  }
  NLS2_TRACE(trace, "Convert string2 to UChars.");
  error = nls2::codepage::convert(search.text2, converter, string, length);
  if (failed(error)) {
    search.release();
    NLS2_TRACE(trace, "Could convert string 2 to UChars %d", error);
    return false;
  }
  return true;
}

// The lower-case form gets as many units as its source has and no more, so one that grows fails.
// The source ends at its first null.
bool lowerString(Search &search, const Utf16Text &source, Utf16Text &lower, int number) {
  const Trace trace = search.trace;
  lower.length = source.lengthToNull();
  NLS2_TRACE(trace, "Buffer size for string%d to allocate is %d  bytes.", number,
             static_cast<int32_t>(lower.size()));
  NLS2_TRACE(trace, "Allocate memory to hold converted string.");
  if (!nls2::codepage::allocate(lower, trace)) {
    search.release();
    NLS2_TRACE(trace, "Could not allocate memory.");
    return false;
  }
  NLS2_TRACE(trace, "Memory allocated.");
  NLS2_TRACE(trace, "Convert string%d to lower.", number);
  std::memset(lower.units.get(), 0, lower.size());
  UErrorCode error = U_ZERO_ERROR;
  u_strToLower(lower.units.get(), lower.length, source.units.get(), lower.length,
               search.pLocale->icuLocale, &error);
  if (failed(error)) {
    search.release();
    if (number == 1) {
      NLS2_TRACE(trace, "Could not convert to lower case %d", error);
    } else {
      NLS2_TRACE(trace, "Could convert to lower case %d", error);
    }
    return false;
  }
  if (number == 1) {
    NLS2_TRACE(trace, "String1 converted to lower case.");
  }
  return true;
}

const UChar *firstOf(const Utf16Text &sought, const Utf16Text &text) {
  return u_strFindFirst(text.units.get(), text.lengthToNull(), sought.units.get(),
                        sought.lengthToNull());
}

int32_t answer(Trace trace, const UChar *found) {
  if (found == nullptr) {
    NLS2_TRACE(trace, "Did not find occurence of string2 in string1.");
    return 0;
  }
  NLS2_TRACE(trace, "Found occurence of string2 in string1.");
  return 1;
}

int32_t find(Search &search, uint32_t options) {
  if ((options & IGNORECASE) == 0) {
    NLS2_TRACE(search.trace, "Locate string2 within string1");
    return answer(search.trace, firstOf(search.text2, search.text1));
  }
  NLS2_TRACE(search.trace, "IGNORECASE option detected");
  if (!lowerString(search, search.text1, search.lower1, 1) ||
      !lowerString(search, search.text2, search.lower2, 2)) {
    return searchFailed;
  }
  NLS2_TRACE(search.trace, "Look for string2 in string1.");
  return answer(search.trace, firstOf(search.lower2, search.lower1));
}

} // namespace

int32_t NLS2_Findstr(const NLS2_Locale *pLocale, const char *pString1, int32_t len1,
                     const char *pString2, int32_t len2, uint32_t options) {
  static constinit TRC1_EntryBlock anchor = nls2::trace::anchorOf("NLS2_Findstr");
  Frame frame(anchor);
  NLS2_TRACE(frame,
             "Input parameters: pLocale %X, pString1 %s, len1 %d, pString2 %s, len2 %d, "
             "options %x.",
             nls2::trace::low32(pLocale), BoundedText(pString1, len1).c_str(), len1,
             BoundedText(pString2, len2).c_str(), len2, options);
  if (failed(nls2::locale::validateLocale(pLocale))) {
    NLS2_TRACE(frame, "Invalid locale object.");
    return frame.result(searchFailed);
  }
  Search search{frame, pLocale};
  if (!openConverter(search) || !convertString1(search, pString1, len1) ||
      !convertString2(search, pString2, len2)) {
    return frame.result(searchFailed);
  }
  return frame.result(find(search, options));
}
