// Two threads release the same locale object.

#include "nls2.h"
#include "support/recording_host.h"
#include "sys1.h"

#include <algorithm>
#include <gtest/gtest.h>
#include <thread>

namespace {

// Both threads have found the object valid before either gets the lock.
TEST(LocaleObject, IsGoneWhenAnotherThreadReleasedItFaster) {
  for (const bool behindAnother : {false, true}) {
    int32_t status = -1;
    NLS2_Locale *const before = behindAnother ? NLS2_allocateLocale(&status) : nullptr;
    NLS2_Locale *const shared = NLS2_allocateLocale(&status);
    SYS1_GetLock(&LocaleObjectList_Lock);
    const support::Recording recording(support::traceAll);
    int32_t results[2] = {-1, -1};
    std::thread first([&] { results[0] = NLS2_ReleaseLocale(shared); });
    std::thread second([&] { results[1] = NLS2_ReleaseLocale(shared); });
    const auto times = [&](const char *text) {
      const auto lines = recording.lines();
      return std::count(lines.begin(), lines.end(), std::string("NLS2_ReleaseLocale: ") + text);
    };
    while (times("Acquire lock on linked-list.") < 2) {
      std::this_thread::yield();
    }
    SYS1_ReleaseLock(&LocaleObjectList_Lock);
    first.join();
    second.join();
    EXPECT_EQ(results[0] | results[1], 0);
    EXPECT_EQ(times("Locale structure removed from list."), 1);
    EXPECT_EQ(times("Linked-list has entries"), behindAnother ? 2 : 1);
    EXPECT_EQ(times("Release lock on linked-list."), 2);
    EXPECT_EQ(pLocaleObjectList, before);
    EXPECT_EQ(NLS2_ReleaseLocale(before), behindAnother ? 0 : 37);
  }
}

} // namespace
