// The detail lines that show a locale object whole.
#pragma once

#include "nls2.h"
#include "trace/frame.h"

namespace nls2::locale {

inline void traceObject(trace::Trace trace, const NLS2_Locale *pLocale) {
  NLS2_TRACE(trace, "Locale Object %X", trace::low32(pLocale));
  NLS2_TRACE(trace, "\tICU_Locale %s", pLocale->icuLocale);
  NLS2_TRACE(trace, "\tCodepage %d", pLocale->codepage);
  NLS2_TRACE(trace, "\tLanguage ID %d", pLocale->languageId);
}

} // namespace nls2::locale
