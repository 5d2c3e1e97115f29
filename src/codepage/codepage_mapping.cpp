// NLS2_MapCodepageIdToName: makes an ICU converter of a code page number. The
// work is in the header, which is compiled into its hot callers.

#include "codepage/codepage_mapping.h"

UConverter *NLS2_MapCodepageIdToName(int32_t codepage, int32_t *twoNullTerminator,
                                     int32_t *status) {
  return nls2::codepage::mapCodepageIdToName(codepage, twoNullTerminator, status);
}
