// The calls of this room's case files.

#include "support/dispatch.h"

#include <gtest/gtest.h>

TEST(Text, Cases) {
  support::expectCases(CASES_FOLDER,
                       {CALL(NLS2_Strcoll), CALL(NLS2_Findstr), CALL(NLS2_MapString)});
}
