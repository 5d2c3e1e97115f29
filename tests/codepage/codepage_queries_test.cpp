// NLS2_GetCodepageName and NLS2_GetCodepageId, beside the rows of calls.tsv.

#include "nls2.h"
#include "support/default_probe.h"
#include "support/icu_probe.h"
#include "support/recording_host.h"

#include <gtest/gtest.h>

namespace {

TEST(GetCodepageName, AsksForTheCcsidByDetailTracingAlone) {
  const support::Answers noCcsid{.ccsidError = U_INVALID_TABLE_FORMAT};
  const support::Answering answering(noCcsid);
  for (const auto flags : {support::traceOff, support::traceEvents, support::traceDetail}) {
    const int open = support::openConverters();
    char name[60] = "untouched";
    const support::Recording recording(flags);
    EXPECT_EQ(NLS2_GetCodepageName(37, name, 0), flags == support::traceDetail ? 13 : 0);
    EXPECT_STREQ(name, flags == support::traceDetail ? "untouched" : "ibm-37_P100-1995");
    EXPECT_EQ(support::openConverters(), open);
  }
}

// ICU opens its default converter for a null name.
TEST(GetCodepageId, NullNameIsIcusDefault) {
  const support::Recording recording(support::traceAll);
  int32_t status = -1;
  EXPECT_NE(NLS2_GetCodepageId(nullptr, &status), 0U);
  EXPECT_EQ(status, 0);
  EXPECT_EQ(recording.lines()[1], "NLS2_GetCodepageId: Input parameters: CodePageName (null).");
}

} // namespace
