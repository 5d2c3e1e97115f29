// The two ways to a converter for a locale object's code page.
#pragma once

#include "codepage/codepage_mapping.h"
#include "nls2.h"

#include <unicode/ucnv.h>

namespace nls2::codepage {

// Through the names that NLS2_MapCodepageIdToName knows; the two-null flag is not needed here.
inline UConverter *openMapped(const NLS2_Locale *pLocale, int32_t *status) {
  int32_t twoNull = 0;
  return mapCodepageIdToName(static_cast<int32_t>(pLocale->codepage), &twoNull, status);
}

// Without those names: every number goes to ICU as a CCSID.
inline UConverter *openAsCcsid(const NLS2_Locale *pLocale, UErrorCode *error) {
  return ucnv_openCCSID(static_cast<int32_t>(pLocale->codepage), UCNV_IBM, error);
}

} // namespace nls2::codepage
