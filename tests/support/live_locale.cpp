// Live locale objects for tests.

#include "support/live_locale.h"

#include <gtest/gtest.h>
#include <unicode/uloc.h>

namespace support {

LiveLocale::LiveLocale(uint32_t codepage, const char *name) {
  UErrorCode error = U_ZERO_ERROR;
  uloc_setDefault("en_US", &error);
  int32_t status = -1;
  object_ = NLS2_GetLocale(NLS2_LanguageIDFromShortPosixName(name, &status), codepage, 0, &status);
  EXPECT_EQ(status, 0) << name;
}

LiveLocale::~LiveLocale() { EXPECT_EQ(NLS2_ReleaseLocale(object_), 0); }

} // namespace support
