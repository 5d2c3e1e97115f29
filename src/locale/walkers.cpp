// Who is walking the registry.

#include "locale/walkers.h"

#include <ctime>
#include <pthread.h>
#include <sched.h>

namespace nls2::locale {

namespace detail {

constinit std::atomic<uint32_t> currentRound{0};
constinit Stripe stripeTable[stripes] = {};
constinit thread_local std::size_t ownStripe __attribute__((tls_model("initial-exec"))) = 0;

std::size_t chooseStripe() {
  static constinit std::atomic<std::size_t> threads{0};
  ownStripe = threads.fetch_add(1, std::memory_order_relaxed) % stripes + 1;
  return ownStripe;
}

} // namespace detail

namespace {

// A walk takes microseconds, so mostly the processor is only offered to it. Where that does not
// help, the walk may belong to a thread of lower real-time priority that a yield never lets run.
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
  for (const detail::Stripe &stripe : detail::stripeTable) {
    for (unsigned attempt = 0; stripe.walksOfRound[round].load(std::memory_order_seq_cst) != 0;
         ++attempt) {
      giveWay(attempt);
    }
  }
}

// The threads whose walks a fork cut off do not exist in the child.
void forgetWalks() {
  for (detail::Stripe &stripe : detail::stripeTable) {
    stripe.walksOfRound[0].store(0, std::memory_order_relaxed);
    stripe.walksOfRound[1].store(0, std::memory_order_relaxed);
  }
}

__attribute__((constructor)) void watchForks() { pthread_atfork(nullptr, nullptr, forgetWalks); }

} // namespace

// Both rounds are seen empty once. The other round goes first: it can hold only walks that read the
// round just before it was last changed. Then new walks are sent there, and the current one drains.
void waitForWalkers() {
  const uint32_t current = detail::currentRound.load(std::memory_order_relaxed);
  waitForRound(current ^ 1);
  detail::currentRound.store(current ^ 1, std::memory_order_relaxed);
  waitForRound(current);
}

} // namespace nls2::locale
