// Who is walking the registry.

#include "locale/walkers.h"

#include <pthread.h>
#include <sched.h>

namespace nls2::locale {

namespace detail {

constinit std::atomic<uint32_t> currentRound{0};
constinit Stripe stripeTable[stripes] = {};
thread_local std::size_t ownStripe __attribute__((tls_model("initial-exec"))) = 0;

std::size_t chooseStripe() {
  static constinit std::atomic<std::size_t> threads{0};
  ownStripe = threads.fetch_add(1, std::memory_order_relaxed) % stripes + 1;
  return ownStripe;
}

} // namespace detail

namespace {

void waitForRound(uint32_t round) {
  for (detail::Stripe &stripe : detail::stripeTable) {
    while (stripe.walksOfRound[round].load(std::memory_order_seq_cst) != 0) {
      sched_yield();
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

// A walk counts in the round that it read, which may be the one before the current; so both rounds
// are seen empty once, each while new walks go to the other.
void waitForWalkers() {
  for (int i = 0; i < 2; ++i) {
    const uint32_t ended = detail::currentRound.fetch_xor(1, std::memory_order_seq_cst);
    waitForRound(ended);
  }
}

} // namespace nls2::locale
