// The process's default locale and code page, as ICU reports them.
#pragma once

#include "nls2.h"
#include "trace/frame.h"

namespace nls2::locale {

// ICU's default locale name; null or empty if it has none.
const char *defaultLocaleName();

// Looks up ICU's default converter name, or the fallback's, and stores its code page in the object,
// even if the look-up fails. Returns NLS2_GetCodepageId's status.
int32_t setDefaultCodepage(trace::Trace trace, NLS2_Locale *pLocale);

} // namespace nls2::locale
