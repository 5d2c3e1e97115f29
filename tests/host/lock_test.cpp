// The default lock, which lives in 28 bytes of its caller's.

#include "sys1.h"

#include <atomic>
#include <chrono>
#include <cstring>
#include <ctime>
#include <gtest/gtest.h>
#include <thread>
#include <vector>

namespace {

constexpr unsigned char canary = 0xA5;

// A lock as the library holds one, with bytes around it that are none of its business.
struct GuardedLock {
  alignas(uint32_t) unsigned char before[16];
  unsigned char lock[SYS1_LOCK_SIZE];
  unsigned char after[16];

  GuardedLock() {
    std::memset(this, canary, sizeof *this);
    std::memset(lock, 0, sizeof lock);
  }
  bool canariesAreWhole() const {
    const std::vector<unsigned char> whole(sizeof before, canary);
    return std::memcmp(before, whole.data(), sizeof before) == 0 &&
           std::memcmp(after, whole.data(), sizeof after) == 0;
  }
};

std::chrono::nanoseconds cpuTimeOfThisThread() {
  timespec used{};
  clock_gettime(CLOCK_THREAD_CPUTIME_ID, &used);
  return std::chrono::seconds(used.tv_sec) + std::chrono::nanoseconds(used.tv_nsec);
}

} // namespace

TEST(Lock, ExcludesAllOthersAndKeepsToItsBytes) {
  constexpr int threadCount = 8;
  constexpr int rounds = 20000;
  GuardedLock guarded;
  int counter = 0; // not atomic: the lock alone protects it
  std::thread threads[threadCount];
  for (std::thread &thread : threads) {
    thread = std::thread([&] {
      for (int round = 0; round < rounds; ++round) {
        SYS1_GetLock(guarded.lock);
        const int seen = counter;
        if (round % 1000 == 0) {
          std::this_thread::yield(); // a holder that is interrupted makes the others wait
        }
        counter = seen + 1;
        SYS1_ReleaseLock(guarded.lock);
      }
    });
  }
  for (std::thread &thread : threads) {
    thread.join();
  }
  EXPECT_EQ(counter, threadCount * rounds);
  EXPECT_TRUE(guarded.canariesAreWhole());
}

TEST(Lock, PutsWaitersToSleepAndWakesThemAll) {
  using namespace std::chrono_literals;
  GuardedLock guarded;
  std::atomic<int> waiting{0};
  std::atomic<int> entered{0};
  std::atomic<std::chrono::nanoseconds> mostCpuTime{0ns};
  SYS1_GetLock(guarded.lock);
  std::thread threads[4];
  for (std::thread &thread : threads) {
    thread = std::thread([&] {
      const auto before = cpuTimeOfThisThread();
      ++waiting;
      SYS1_GetLock(guarded.lock);
      mostCpuTime = std::max(mostCpuTime.load(), cpuTimeOfThisThread() - before);
      ++entered;
      SYS1_ReleaseLock(guarded.lock);
    });
  }
  while (waiting < 4) {
    std::this_thread::yield();
  }
  std::this_thread::sleep_for(300ms);
  EXPECT_EQ(entered, 0) << "entered a lock that is held";
  SYS1_ReleaseLock(guarded.lock);
  for (std::thread &thread : threads) {
    thread.join();
  }
  EXPECT_EQ(entered, 4);
  EXPECT_LT(mostCpuTime.load(), 30ms) << "a waiter spins";
}
