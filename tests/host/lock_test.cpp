// The default lock, in 28 bytes of the caller's memory.

#include "sys1.h"

#include <atomic>
#include <cstring>
#include <ctime>
#include <functional>
#include <gtest/gtest.h>
#include <thread>
#include <vector>

namespace {

// A lock like the library's, between bytes that must not change.
struct GuardedLock {
  alignas(uint32_t) char before[16], lock[SYS1_LOCK_SIZE], after[16];

  GuardedLock() {
    std::memset(this, '#', sizeof *this);
    std::memset(lock, 0, sizeof lock);
  }
  ~GuardedLock() {
    EXPECT_EQ(std::string(before, 16) + std::string(after, 16), std::string(32, '#'));
  }
};

void inThreads(int count, const std::function<void()> &work) {
  std::vector<std::jthread> threads; // joined at their end
  for (int i = 0; i < count; ++i) {
    threads.emplace_back(work);
  }
}

double cpuSecondsOfThisThread() {
  timespec used{};
  clock_gettime(CLOCK_THREAD_CPUTIME_ID, &used);
  return static_cast<double>(used.tv_sec) + static_cast<double>(used.tv_nsec) / 1e9;
}

TEST(Lock, ExcludesAllOthersAndKeepsToItsBytes) {
  GuardedLock guarded;
  int counter = 0; // not atomic: the lock alone protects it
  inThreads(8, [&] {
    for (int round = 0; round < 20000; ++round) {
      SYS1_GetLock(guarded.lock);
      const int seen = counter;
      if (round % 1000 == 0) {
        std::this_thread::yield(); // a holder that is interrupted makes the others wait
      }
      counter = seen + 1;
      SYS1_ReleaseLock(guarded.lock);
    }
  });
  EXPECT_EQ(counter, 8 * 20000);
}

TEST(Lock, PutsWaitersToSleepAndWakesThemAll) {
  GuardedLock guarded;
  std::atomic<int> waiting{0};
  std::atomic<int> entered{0};
  std::atomic<double> mostCpuTime{0};
  SYS1_GetLock(guarded.lock);
  const std::jthread holder([&] {
    while (waiting < 4) {
      std::this_thread::yield();
    }
    std::this_thread::sleep_for(std::chrono::milliseconds(300));
    EXPECT_EQ(entered, 0) << "entered a lock that is held";
    SYS1_ReleaseLock(guarded.lock);
  });
  inThreads(4, [&] {
    const double before = cpuSecondsOfThisThread();
    ++waiting;
    SYS1_GetLock(guarded.lock);
    mostCpuTime = std::max(mostCpuTime.load(), cpuSecondsOfThisThread() - before);
    ++entered;
    SYS1_ReleaseLock(guarded.lock);
  });
  EXPECT_EQ(entered, 4);
  EXPECT_LT(mostCpuTime.load(), 0.03) << "a waiter spins";
}

} // namespace
