// Opens a converter by its CCSID and uses it with ICU's C++ classes.

#include <nls2.h>

#include <iostream>
#include <unicode/ucnv.h>
#include <unicode/unistr.h>

int main() {
  int32_t twoNulls = -1;
  int32_t status = -1;
  const icu::LocalUConverterPointer converter(NLS2_MapCodepageIdToName(930, &twoNulls, &status));
  if (status > 0 || twoNulls != 0) {
    std::cerr << "status " << status << ", two nulls " << twoNulls << "\n";
    return 1;
  }
  UErrorCode error = U_ZERO_ERROR;
  const icu::UnicodeString text("\x0E\x45\x62\x0F", 4, converter.getAlias(), error);
  if (U_FAILURE(error) || text != icu::UnicodeString(u'\u65E5')) {
    std::cerr << "wrong text, " << u_errorName(error) << "\n";
    return 1;
  }
  return 0;
}
