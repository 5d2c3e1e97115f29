// The process's default locale and code page, as ICU reports them.

#include "locale/process_default.h"

#include "trace/status.h"

#include <unicode/ucnv.h>
#include <unicode/uloc.h>

namespace nls2::locale {

namespace {

constexpr const char *usAscii = "US-ASCII";
constexpr const char *usEbcdic = "ibm-37_P100-1995"; // ICU's canonical name of CCSID 37

// Meant to distinguish an ASCII machine from an EBCDIC one, but "1" is 0x31 on the one and 0xF1
// on the other, never 0x19. Callers have come to rely on US EBCDIC.
const char *fallbackCodepageName(trace::Trace trace) {
  constexpr const char *probe = "1";
  NLS2_TRACE(trace, "ICU returned null codepage, Force it to be ASCII or EBCDIC.");
  if (*probe == 0x19) {
    NLS2_TRACE(trace, "Forced default codepage to be US ASCII.");
    return usAscii;
  }
  NLS2_TRACE(trace, "Forced default codepage to be US EBCDIC.");
  return usEbcdic;
}

} // namespace

const char *defaultLocaleName() { return uloc_getDefault(); }

int32_t setDefaultCodepage(trace::Trace trace, NLS2_Locale *pLocale) {
  const char *name = ucnv_getDefaultName();
  if (name == nullptr) {
    name = fallbackCodepageName(trace);
  }
  NLS2_TRACE(trace, "Retrieve codepage based on codepage name. %s.", name);
  int32_t status = U_ZERO_ERROR;
  pLocale->codepage = NLS2_GetCodepageId(name, &status);
  if (failed(status)) {
    NLS2_TRACE(trace, "Could not get codepage based on codepage name.");
  }
  return status;
}

} // namespace nls2::locale
