// realloc_mem, seen through the function that calls it.

#include "nls2.h"
#include "support/heap_probe.h"
#include "support/icu_probe.h"
#include "support/recording_host.h"

#include <climits>
#include <gtest/gtest.h>

namespace {

using support::Recording;

// A padded translation whose work buffer takes 2 * destLen + 2 bytes and is refused: `dest` is not
// written, so it need not be as large as it claims.
std::string traceWithoutMemory(int32_t destLen, support::TraceFlags flags) {
  char dest[4] = {'d', 'e', 's', 't'};
  int32_t consumed = -1;
  int32_t status = -1;
  const int open = support::openConverters();
  const Recording recording(flags);
  EXPECT_EQ(
      NLS2_TranslateString(819, dest, destLen, 37, "\xC1", 1, &consumed, NLS2_STRING_FILL, &status),
      0);
  EXPECT_EQ(status, NLS2_ERR_NO_MEMORY);
  EXPECT_EQ(consumed, 0);
  EXPECT_EQ(std::string(dest, 4), "dest");
  EXPECT_EQ(support::openConverters(), open);
  const std::string text = recording.text({{"NLS2_TranslateString", "T"}, {"realloc_mem", "R"}});
  const size_t start = text.find("T: Allocate");
  return start == std::string::npos ? text : text.substr(start);
}

TEST(Memory, FailureIsReportedUnderTheCallersAnchor) {
  if (!support::heapCanRefuse) {
    GTEST_SKIP() << "the sanitizer's heap cannot be made to refuse";
  }
  const support::FailingReallocs failing(2 * 777 + 2);
  EXPECT_EQ(traceWithoutMemory(777, support::traceAll),
            "T: Allocate memory to hold entire utf16 string.\n"
            "R> entry\n"
            "T: Memory allocation failure: Size(1556), Old((nil))\n"
            "R=\n"
            "T: Could not allocate memory.\n"
            "T= 0\n");
}

TEST(Memory, SizeBeyond32BitsIsNeverAskedFor) {
  EXPECT_EQ(traceWithoutMemory(INT32_MAX, support::traceAll),
            "T: Allocate memory to hold entire utf16 string.\n"
            "T: Could not allocate memory.\n"
            "T= 0\n");
}

} // namespace
