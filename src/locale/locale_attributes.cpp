// The numbers of a locale object: NLS2_GetLocaleNumInfo, NLS2_SetLocaleNumInfo,
// NLS2_GetLocaleCodepageId.

#include "locale/locale_map.h"
#include "locale/registry.h"
#include "locale/trace_object.h"
#include "nls2.h"
#include "trace/frame.h"
#include "trace/status.h"

#include <cstring>

namespace {

using nls2::failed;
using nls2::trace::Frame;
using nls2::trace::Trace;

// The table's end mark. As a new value it means: change nothing.
constexpr uint32_t keepValue = NLS2_LANGUAGE_ID_END;

int32_t setLanguage(Trace trace, NLS2_Locale *pLocale, uint32_t languageId) {
  NLS2_TRACE(trace, "Request to change language id.");
  const LocaleMapEntry *entry = nls2::locale::findLanguage(languageId);
  if (entry == nullptr) {
    NLS2_TRACE(trace, "Matching entry not found.");
    return NLS2_ERR_INVALID_LOCALE;
  }
  NLS2_TRACE(trace, "Found language id %d in table.", languageId);
  NLS2_TRACE(trace, "Set language id to %d.", languageId);
  pLocale->languageId = languageId;
  NLS2_TRACE(trace, "Set locale name to %s.", entry->localeName);
  std::strcpy(pLocale->icuLocale, entry->localeName);
  return U_ZERO_ERROR;
}

void setCodepage(Trace trace, NLS2_Locale *pLocale, uint32_t codepage) {
  NLS2_TRACE(trace, "Request to set the code page to %d", codepage);
  pLocale->codepage = codepage;
  NLS2_TRACE(trace, "Set codepage to %d.", codepage);
}

} // namespace

uint32_t NLS2_GetLocaleNumInfo(const NLS2_Locale *pLocale, uint32_t type, int32_t *pStatus) {
  static constinit TRC1_EntryBlock anchor = nls2::trace::anchorOf("NLS2_GetLocaleNumInfo");
  Frame frame(anchor);
  NLS2_TRACE(frame, "Input parameters: pLocale %X, type %d.", nls2::trace::low32(pLocale), type);
  if (failed(nls2::locale::validateLocale(pLocale))) {
    NLS2_TRACE(frame, "Invalid locale.");
    *pStatus = NLS2_ERR_INVALID_LOCALE;
    return frame.result(0U);
  }
  *pStatus = U_ZERO_ERROR;
  switch (type) {
  case NLS2_ATTRIBUTE_LANGUAGE_ID:
    NLS2_TRACE(frame, "Option selected is  LANGUAGE ID.");
    return frame.result(pLocale->languageId);
  case NLS2_ATTRIBUTE_CODEPAGE:
    NLS2_TRACE(frame, "Option selected is  CODEPAGEID.");
    return frame.result(pLocale->codepage);
  default:
    NLS2_TRACE(frame, "Invalid type selected %X.", type);
    *pStatus = NLS2_ERR_INVALID_PARAMETER;
    return frame.result(0U);
  }
}

int32_t NLS2_SetLocaleNumInfo(NLS2_Locale *pLocaleToChange, uint32_t attribute, uint32_t value,
                              uint32_t options) {
  static constinit TRC1_EntryBlock anchor = nls2::trace::anchorOf("NLS2_SetLocaleNumInfo");
  Frame frame(anchor);
  NLS2_TRACE(frame, "Input parameters: pLocaleToChange %X, attribute %d, value %d, options %d.",
             nls2::trace::low32(pLocaleToChange), attribute, value, options);
  if (failed(nls2::locale::validateLocale(pLocaleToChange))) {
    NLS2_TRACE(frame, "Invalid locale structure.");
    return frame.result(int32_t{NLS2_ERR_INVALID_LOCALE});
  }
  int32_t status = U_ZERO_ERROR;
  if (attribute == NLS2_ATTRIBUTE_CODEPAGE) {
    if (value != keepValue) {
      setCodepage(frame, pLocaleToChange, value);
    }
  } else if (attribute == NLS2_ATTRIBUTE_LANGUAGE_ID) {
    if (value != keepValue) {
      status = setLanguage(frame, pLocaleToChange, value);
    }
  } else {
    NLS2_TRACE(frame, "Requested option not valid.");
    status = NLS2_ERR_INVALID_LOCALE;
  }
  nls2::locale::traceObject(frame, pLocaleToChange);
  return frame.result(status);
}

uint32_t NLS2_GetLocaleCodepageId(const NLS2_Locale *pLocale, int32_t *pStatus) {
  static constinit TRC1_EntryBlock anchor = nls2::trace::anchorOf("NLS2_GetLocaleCodepageId");
  Frame frame(anchor);
  NLS2_TRACE(frame, "Input parameter: pLocale %X.", nls2::trace::low32(pLocale));
  *pStatus = U_ZERO_ERROR;
  if (failed(nls2::locale::validateLocale(pLocale))) {
    NLS2_TRACE(frame, "Invalid locale.");
    *pStatus = NLS2_ERR_INVALID_LOCALE;
    return frame.result(0U);
  }
  NLS2_TRACE(frame, "Codepage value is %d", pLocale->codepage);
  return frame.result(pLocale->codepage);
}
