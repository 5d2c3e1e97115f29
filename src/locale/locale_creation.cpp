// Starting the library and obtaining locale objects: NLS2_Init, NLS2_GetLocale,
// NLS2_GetThreadLocale.

#include "locale/locale_map.h"
#include "locale/trace_object.h"
#include "nls2.h"
#include "trace/frame.h"
#include "trace/status.h"

#include <cstring>
#include <unicode/uclean.h>

namespace {

using nls2::failed;
using nls2::trace::Frame;
using nls2::trace::Trace;

// With either of them the new object keeps the defaults.
constexpr uint32_t keepDefaultOptions = 0x2 | NLS2_LOCALE_DEFAULT;

// The first record with this id, or with this code page in both columns.
const LocaleMapEntry *findRequested(uint32_t languageId, uint32_t codepage) {
  return nls2::locale::findEntry([=](const LocaleMapEntry &entry) {
    return entry.languageId == languageId ||
           (entry.asciiCcsid == codepage && entry.ebcdicCcsid == codepage);
  });
}

NLS2_Locale *allocate(Trace trace, int32_t *pStatus) {
  int32_t status = U_ZERO_ERROR;
  NLS2_Locale *pLocale = NLS2_allocateLocale(&status);
  if (failed(status)) {
    NLS2_TRACE(trace, "Could not allocate a locale structure.");
    *pStatus = status;
  }
  return pLocale;
}

} // namespace

int32_t NLS2_Init() {
  static constinit TRC1_EntryBlock anchor = nls2::trace::anchorOf("NLS2_Init");
  Frame frame(anchor);
  UErrorCode status = U_ZERO_ERROR;
  u_init(&status);
  return frame.result(int32_t{status});
}

NLS2_Locale *NLS2_GetLocale(uint32_t languageId, uint32_t codepage, uint32_t options,
                            int32_t *pStatus) {
  static constinit TRC1_EntryBlock anchor = nls2::trace::anchorOf("NLS2_GetLocale");
  Frame frame(anchor);
  NLS2_TRACE(frame, "Input parameters: languageId %d, codepage %d, options %x.", languageId,
             codepage, options);
  *pStatus = U_ZERO_ERROR;
  if (languageId == 0 && codepage == 0) {
    NLS2_TRACE(frame, "Zero language Id and codepage defined.");
    return frame.result(allocate(frame, pStatus));
  }
  NLS2_TRACE(frame, "Locating caller's language id %d, codepage %d in table", languageId, codepage);
  const LocaleMapEntry *entry = findRequested(languageId, codepage);
  if (entry == nullptr) {
    NLS2_TRACE(frame, "Could not find entry within LocaleMap Table.");
    *pStatus = NLS2_ERR_INVALID_PARAMETER;
    return frame.result<NLS2_Locale *>(nullptr);
  }
  NLS2_TRACE(frame, "Located language id %d, codepage %d in table", languageId, codepage);
  NLS2_Locale *pLocale = allocate(frame, pStatus);
  if (pLocale == nullptr) {
    return frame.result(pLocale);
  }
  if ((options & keepDefaultOptions) == 0) {
    NLS2_TRACE(frame, "Initialize Locale based on user inputs");
    std::strcpy(pLocale->icuLocale, entry->localeName);
    if (codepage != 0) {
      pLocale->codepage = codepage;
    }
    pLocale->languageId = entry->languageId;
  }
  nls2::locale::traceObject(frame, pLocale);
  return frame.result(pLocale);
}

NLS2_Locale *NLS2_GetThreadLocale() {
  static constinit TRC1_EntryBlock anchor = nls2::trace::anchorOf("GetThreadLocale");
  const Frame frame(anchor);
  int32_t status = U_ZERO_ERROR;
  NLS2_Locale *pLocale = NLS2_GetLocale(0, 0, 0, &status);
  if (failed(status)) {
    NLS2_TRACE(frame, "Error %d obtaining Thread Locale.", status);
  }
  return pLocale;
}
