// NLS2_MapCodepageIdToName: the one place where a code page number becomes an ICU converter. The
// work is in the header, which is compiled into its hot callers.

#include "codepage/codepage_mapping.h"

UConverter *NLS2_MapCodepageIdToName(int32_t codepage, int32_t *twoNullTerminator,
                                     int32_t *status) {
  return nls2::codepage::mapCodepageIdToName(codepage, twoNullTerminator, status);
}
