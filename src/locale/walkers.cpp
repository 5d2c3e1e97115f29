// Who is reading the registry.

#include "locale/walkers.h"

#include <ctime>
#include <linux/membarrier.h>
#include <sched.h>
#include <sys/syscall.h>
#include <unistd.h>

namespace nls2::locale {

namespace detail {

constinit std::atomic<uint32_t> currentRound{0};
constinit thread_local Counts *ownCounts __attribute__((tls_model("initial-exec"))) = nullptr;

} // namespace detail

namespace {

using detail::Counts;

constexpr std::size_t ownedCounts = 64;
constexpr std::size_t sharedCounts = 16;
constinit Counts table[ownedCounts + sharedCounts] = {};

bool isOwned(const Counts *counts) { return counts < table + ownedCounts; }

constinit std::atomic<std::size_t> threads{0}; // that have read the list
constinit std::atomic<bool> glancesExpected{false};

bool membarrier(int command) { return syscall(SYS_membarrier, command, 0, 0) == 0; }

const bool barriersWork = membarrier(MEMBARRIER_CMD_REGISTER_PRIVATE_EXPEDITED);

// A walk takes microseconds, so yielding the processor is usually enough. If it is not, the walk
// may belong to a thread of lower real-time priority, which a yield never lets run.
void giveWay(unsigned attempt) {
  constexpr unsigned yields = 1000;
  if (attempt < yields) {
    sched_yield();
    return;
  }
  const timespec moment{0, 50'000};
  nanosleep(&moment, nullptr);
}

void waitForRound(uint32_t round) {
  for (const Counts &counts : table) {
    for (unsigned attempt = 0; counts.walksOfRound[round].load(std::memory_order_seq_cst) != 0;
         ++attempt) {
      giveWay(attempt);
    }
  }
}

} // namespace

// A thread's number is taken sequentially consistent with the links: a removal that does not see
// the thread is seen by the thread.
detail::Counts *detail::chooseCounts() {
  const std::size_t number = threads.fetch_add(1, std::memory_order_seq_cst);
  ownCounts = &table[number < ownedCounts ? number : ownedCounts + number % sharedCounts];
  if (isOwned(ownCounts)) {
    ownCounts->plain = barriersWork;
  }
  return ownCounts;
}

void expectGlances() {
  if (!glancesExpected.load(std::memory_order_seq_cst)) {
    glancesExpected.store(true, std::memory_order_seq_cst);
  }
}

// Both rounds are seen empty once. The other round goes first: it can hold only walks that read the
// round just before it was last changed. Then new walks are sent there, and the current one drains.
bool waitForWalkers() {
  const bool alone = threads.load(std::memory_order_seq_cst) == 1;
  if (glancesExpected.exchange(false, std::memory_order_seq_cst) && barriersWork && !alone &&
      !membarrier(MEMBARRIER_CMD_PRIVATE_EXPEDITED)) {
    return false;
  }
  const uint32_t current = detail::currentRound.load(std::memory_order_relaxed);
  waitForRound(current ^ 1);
  detail::currentRound.store(current ^ 1, std::memory_order_relaxed);
  waitForRound(current);
  return true;
}

bool isWalking() {
  const Counts *own = detail::ownCounts;
  return own != nullptr && isOwned(own) &&
         (own->walksOfRound[0].load(std::memory_order_relaxed) != 0 ||
          own->walksOfRound[1].load(std::memory_order_relaxed) != 0);
}

void forgetOtherWalks() {
  for (Counts &counts : table) {
    if (!isOwned(&counts) || &counts != detail::ownCounts) {
      counts.walksOfRound[0].store(0, std::memory_order_relaxed);
      counts.walksOfRound[1].store(0, std::memory_order_relaxed);
    }
  }
}

} // namespace nls2::locale
