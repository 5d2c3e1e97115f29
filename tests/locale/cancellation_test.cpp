// A thread that is cancelled inside the host's trace calls leaves the registry usable. This program
// is its own host: every trace call is a cancellation point.

#include "nls2.h"
#include "trc1.h"

#include <atomic>
#include <gtest/gtest.h>
#include <pthread.h>
#include <unistd.h>
#if defined(__SANITIZE_ADDRESS__)
#include <sanitizer/lsan_interface.h>
#endif

namespace {

// Counts down the thread's trace calls; at 0 it is cancelled. Above 0 at the end: there were fewer.
std::atomic<int> callsLeft{0};

void mayBeCancelled() {
  if (--callsLeft == 0) {
    pthread_cancel(pthread_self());
  }
  pthread_testcancel();
}

void *makeAndRelease(void *) {
#if defined(__SANITIZE_ADDRESS__)
  __lsan_disable(); // a cancelled thread loses an object that is not on the list yet
#endif
  int32_t status = 0;
  NLS2_Locale *pLocale = NLS2_GetLocale(0x03480001, 37, 0, &status);
  NLS2_ReleaseLocale(pLocale);
  return nullptr;
}

} // namespace

uint32_t TRC1_Sync(TRC1_EntryBlock *) { return TRC1_FLAG_DETAIL | TRC1_FLAG_EVENTS; }
void TRC1_Event(TRC1_EntryBlock *, uint32_t, uint32_t, ...) { mayBeCancelled(); }
void TRC1_Printf(TRC1_EntryBlock *, uint32_t, const char *, ...) { mayBeCancelled(); }
void TRC1_Dump(TRC1_EntryBlock *, uint32_t, const void *, uint32_t, uint32_t) { mayBeCancelled(); }

TEST(Cancellation, AtAnyTraceCallLeavesTheListUnlocked) {
  alarm(30); // if the lock stayed held, the next call would wait for ever
  void *result = PTHREAD_CANCELED;
  int calls = 0;
  while (result == PTHREAD_CANCELED) {
    callsLeft = ++calls;
    pthread_t thread{};
    ASSERT_EQ(pthread_create(&thread, nullptr, makeAndRelease, nullptr), 0);
    ASSERT_EQ(pthread_join(thread, &result), 0);
    // Inside the lock it is delayed until the next trace call.
    EXPECT_EQ(result == PTHREAD_CANCELED, callsLeft <= 0) << "cancelled at trace call " << calls;
    callsLeft = 0;
    while (pLocaleObjectList != nullptr) { // made by the thread and not released
      ASSERT_EQ(NLS2_ReleaseLocale(pLocaleObjectList), 0);
    }
  }
  EXPECT_GT(calls, 30);
}
