// NLS2_Findstr: the buffer that two of its ways out leave behind.

#include "nls2.h"
#include "support/heap_probe.h"
#include "support/icu_probe.h"
#include "support/live_locale.h"

#include <gtest/gtest.h>
#include <malloc.h>

// A sanitizer's heap does not tell.
#if !defined(__SANITIZE_ADDRESS__) && !defined(__SANITIZE_THREAD__)
namespace {

// What a call leaves on the heap, by the heap's own count; its blocks are too large for a cache.
TEST(Findstr, TwoFailuresLeaveTheFirstBufferBehind) {
  const support::LiveLocale live(819);
  const std::string one(20000, 'a'); // 40,002 bytes
  const std::string two(15000, 'b'); // 30,002
  const struct {
    const char *function; // fails at this call
    int call;
    size_t reallocSize; // fails
    size_t left;
  } rows[] = {{"none", 0, 0, 0},
              {"ucnv_toUChars", 2, 0, 0},
              {"ucnv_toUChars", 3, 0, 40002},
              {"none", 0, 30002, 40002},
              {"ucnv_toUChars", 4, 0, 0}};
  for (const auto &row : rows) {
    constexpr size_t calls = 8;
    const size_t before = mallinfo2().uordblks;
    for (size_t i = 0; i < calls; ++i) {
      const support::FailingConversion failing(row.function, row.call, U_MEMORY_ALLOCATION_ERROR);
      const support::FailingReallocs refused(row.reallocSize);
      NLS2_Findstr(live.get(), one.data(), 20000, two.data(), 15000, IGNORECASE);
    }
    const auto left = static_cast<double>(mallinfo2().uordblks - before) / calls;
    EXPECT_NEAR(left, static_cast<double>(row.left), 1024) << row.function << ' ' << row.call;
  }
}

} // namespace
#endif
