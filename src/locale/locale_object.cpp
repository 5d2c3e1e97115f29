// The life of a locale object: NLS2_allocateLocale, NLS2_initLocaleObject, NLS2_ValidateLocale,
// NLS2_ReleaseLocale.

#include "locale/locale_map.h"
#include "locale/process_default.h"
#include "locale/registry.h"
#include "nls2.h"
#include "trace/frame.h"
#include "trace/status.h"

#include <cstdlib>
#include <cstring>
#include <unicode/uloc.h>

namespace {

using nls2::failed;
using nls2::trace::Frame;
using nls2::trace::Trace;

constexpr const char *forcedLocale = "en_US";

// As wide as a name in the table.
using BaseName = char[sizeof(LocaleMapEntry::localeName)];
static_assert(sizeof(BaseName) <= sizeof(NLS2_Locale::icuLocale));

const char *nativeLocaleName(Trace trace) {
  NLS2_TRACE(trace, "Get the current native locale.");
  const char *name = nls2::locale::defaultLocaleName();
  NLS2_TRACE(trace, "Locale returned is %s.", nls2::trace::text(name));
  if (name == nullptr || *name == '\0') {
    name = forcedLocale;
    NLS2_TRACE(trace, "Locale returned null, setting locale to %s.", name);
  }
  return name;
}

bool takeBaseName(Trace trace, const char *name, BaseName &baseName) {
  NLS2_TRACE(trace, "Getting the locale basename.");
  std::memset(baseName, 0, sizeof baseName);
  UErrorCode status = U_ZERO_ERROR;
  uloc_getBaseName(name, baseName, sizeof baseName, &status);
  if (failed(status)) {
    NLS2_TRACE(trace, "Error getting locale base name. %d", status);
    return false;
  }
  baseName[sizeof baseName - 1] = '\0'; // ICU may have filled the buffer to the last byte
  NLS2_TRACE(trace, "Locale basename is %s.", baseName);
  return true;
}

bool setLanguage(Trace trace, const BaseName &baseName, NLS2_Locale *pLocale) {
  NLS2_TRACE(trace, "Locate locale basename in table.");
  const LocaleMapEntry *entry = nls2::locale::findNameInside(baseName);
  if (entry == nullptr) {
    NLS2_TRACE(trace, "Basename not found in table. Not valid Locale name.");
    return false;
  }
  NLS2_TRACE(trace, "Entry found in table. LangID is %d, ICU_Locale is %s.", entry->languageId,
             baseName);
  pLocale->languageId = entry->languageId;
  std::strcpy(pLocale->icuLocale, baseName);
  return true;
}

} // namespace

NLS2_Locale *NLS2_allocateLocale(int32_t *pStatus) {
  static constinit TRC1_EntryBlock anchor = nls2::trace::anchorOf("NLS2_allocateLocale");
  Frame frame(anchor);
  *pStatus = U_ZERO_ERROR;
  auto *pLocale = static_cast<NLS2_Locale *>(std::malloc(sizeof(NLS2_Locale)));
  if (pLocale == nullptr) {
    NLS2_TRACE(frame, "Error allocating memory");
    *pStatus = NLS2_ERR_NO_MEMORY;
    return nullptr;
  }
  std::memset(pLocale, 0, sizeof *pLocale);
  NLS2_TRACE(frame, "Preparing to initialize Locale structure.");
  const int32_t status = NLS2_initLocaleObject(pLocale);
  if (failed(status)) {
    NLS2_TRACE(frame, "Error initializing locale object %d", status);
    std::free(pLocale);
    *pStatus = status;
    return nullptr;
  }
  nls2::locale::append(frame, pLocale);
  NLS2_TRACE(frame, "Locale object %X allocated and initialized.", nls2::trace::low32(pLocale));
  return frame.result(pLocale);
}

int32_t NLS2_initLocaleObject(NLS2_Locale *pLocale) {
  static constinit TRC1_EntryBlock anchor = nls2::trace::anchorOf("NLS2_initLocaleObject");
  Frame frame(anchor);
  BaseName baseName;
  if (!takeBaseName(frame, nativeLocaleName(frame), baseName) ||
      !setLanguage(frame, baseName, pLocale)) {
    return frame.result(int32_t{NLS2_ERR_INVALID_PARAMETER});
  }
  NLS2_TRACE(frame, "Retrieve codepage name using locale basename %s.", baseName);
  const int32_t status = nls2::locale::setDefaultCodepage(frame, pLocale);
  if (!failed(status)) {
    NLS2_TRACE(frame, "Locale object successfully initialized.");
  }
  return frame.result(status);
}

int32_t NLS2_ValidateLocale(const NLS2_Locale *pLocale) {
  return nls2::locale::validateLocale(pLocale);
}

int32_t NLS2_ReleaseLocale(NLS2_Locale *pNLS2_Locale) {
  static constinit TRC1_EntryBlock anchor = nls2::trace::anchorOf("NLS2_ReleaseLocale");
  Frame frame(anchor);
  NLS2_TRACE(frame, "Input parameter: pNLS2_Locale %X.", nls2::trace::low32(pNLS2_Locale));
  NLS2_TRACE(frame, "Releasing Locale object %X.", nls2::trace::low32(pNLS2_Locale));
  if (failed(nls2::locale::validateLocale(pNLS2_Locale))) {
    NLS2_TRACE(frame, "Invalid locale specified.");
    return frame.result(int32_t{NLS2_ERR_INVALID_PARAMETER});
  }
  nls2::locale::remove(frame, pNLS2_Locale);
  return frame.result(0);
}
