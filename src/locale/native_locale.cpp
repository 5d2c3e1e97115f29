// The host's own locale: NLS2_SetLocaleFromNative, NLS2_ConvertNativeLocale.

#include "locale/locale_map.h"
#include "locale/process_default.h"
#include "nls2.h"
#include "trace/frame.h"
#include "trace/status.h"

#include <cstring>

namespace {

using nls2::failed;
using nls2::trace::Frame;
using nls2::trace::Trace;

using PosixName = char[sizeof(LocaleMapEntry::localeName)];

// The identifier to look for: ICU's default for "C", else a copy cut at the buffer's end.
const char *identifierOf(Trace trace, const char *pPosixID, PosixName &buffer) {
  if (std::strcmp(pPosixID, "C") == 0) {
    const char *name = nls2::locale::defaultLocaleName();
    NLS2_TRACE(trace, "Default locale from ICU  %s.", nls2::trace::text(name));
    return name != nullptr ? name : "";
  }
  NLS2_TRACE(trace, "Posix ID %s is more than basename C.", pPosixID);
  std::strncpy(buffer, pPosixID, sizeof buffer - 1);
  NLS2_TRACE(trace, "Posix name is %s", buffer);
  return buffer;
}

// Writes into a new object from GetThreadLocale, which nobody will release: a thread has no locale
// of its own.
int32_t applyToThreadLocale(Trace trace, const LocaleMapEntry &entry) {
  NLS2_Locale *pLocale = NLS2_GetThreadLocale();
  if (pLocale == nullptr) {
    return NLS2_ERR_INVALID_LOCALE;
  }
  pLocale->languageId = entry.languageId;
  NLS2_TRACE(trace, "Locale language id is %d.", entry.languageId);
  const int32_t status = nls2::locale::setDefaultCodepage(trace, pLocale);
  if (!failed(status)) {
    std::strcpy(pLocale->icuLocale, entry.localeName);
  }
  return status;
}

} // namespace

int32_t NLS2_SetLocaleFromNative(const char *pPosixID, uint32_t options) {
  static constinit TRC1_EntryBlock anchor = nls2::trace::anchorOf("NLS2_SetLocaleFromNative");
  Frame frame(anchor);
  NLS2_TRACE(frame, "Input parameters: pPosixID %s,options %x.", pPosixID, options);
  PosixName buffer = {};
  const char *identifier = identifierOf(frame, pPosixID, buffer);
  NLS2_TRACE(frame, "Locate entry within LocaleMap Table.");
  const LocaleMapEntry *entry = nls2::locale::findNameInside(identifier);
  if (entry == nullptr) {
    NLS2_TRACE(frame, "Cannot find locale entry in table.");
    return frame.result(int32_t{NLS2_ERR_INVALID_LOCALE});
  }
  NLS2_TRACE(frame, "Found locale entry in table.");
  if ((options & NLS2_THREAD_LOCALE) != 0) {
    NLS2_TRACE(frame, "This is a thread locale request.");
    const int32_t status = applyToThreadLocale(frame, *entry);
    if (failed(status)) {
      return frame.result(status);
    }
  }
  NLS2_TRACE(frame, "This is a normal locale request.");
  return frame.result(0);
}

NLS2_Locale *NLS2_ConvertNativeLocale(const void * /*pNativeLocale*/, uint32_t options,
                                      int32_t *pStatus) {
  static constinit TRC1_EntryBlock anchor = nls2::trace::anchorOf("NLS2_ConvertNativeLocale");
  const Frame frame(anchor);
  *pStatus = U_ZERO_ERROR;
  if ((options & NLS2_LOCALE_DEFAULT) == 0) {
    *pStatus = NLS2_ERR_INVALID_PARAMETER;
    return nullptr;
  }
  NLS2_TRACE(frame, "Setting the locale based on default.");
  int32_t status = U_ZERO_ERROR; // not passed on: a failure shows as null with status 0
  NLS2_Locale *pLocale = NLS2_allocateLocale(&status);
  if (failed(status)) {
    NLS2_TRACE(frame, "Cannot allocate a locale structure. %d", status);
  }
  return pLocale;
}
