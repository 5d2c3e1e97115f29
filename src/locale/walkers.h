// Who is reading the registry: what lets threads read it without the lock while objects are freed.
//
// Every walk over the list counts itself in and out. A removal unlinks its object, then waits until
// every walk that began before has ended, and frees it. Walks that begin later cannot meet the
// object and are not waited for, since they count in the other of two rounds.
//
// A removal must see a walk, or the walk must see the removal. The two locked instructions that
// ensure this take 6 ns each, too long for a glance at a single link. So a glance counts with plain
// loads and stores, in counts that no other thread uses, and a removal that expects glances has the
// kernel run a memory barrier in every running thread: membarrier(2), which takes microseconds. The
// first threads that read the list get counts of their own, and all later ones share the rest.
// Those, and all threads of a system without membarrier(2), glance as they walk.
#pragma once

#include <atomic>
#include <cstddef>
#include <cstdint>

namespace nls2::locale {

namespace detail {

struct alignas(64) Counts {
  std::atomic<uint32_t> walksOfRound[2] = {};
  bool plain = false; // glances need no locked instruction
};

extern constinit std::atomic<uint32_t> currentRound;

// Null until the thread first reads the list.
extern constinit thread_local Counts *ownCounts __attribute__((tls_model("initial-exec")));
Counts *chooseCounts();

} // namespace detail

class Walk {
public:
  Walk() : Walk(true) {}
  ~Walk() {
    if (locked_) {
      count_.fetch_sub(1, std::memory_order_release);
    } else {
      count_.store(count_.load(std::memory_order_relaxed) - 1, std::memory_order_release);
    }
  }
  Walk(const Walk &) = delete;
  Walk &operator=(const Walk &) = delete;

protected:
  // Sequentially consistent with the links: either the walk sees the removal, or the removal sees
  // it. A signal handler between a plain load and store counts up and down: what was loaded holds.
  explicit Walk(bool locked) : Walk(locked, detail::ownCounts) {}

private:
  Walk(bool locked, detail::Counts *own)
      : Walk(locked, own != nullptr ? *own : *detail::chooseCounts()) {}
  Walk(bool locked, detail::Counts &own)
      : count_(own.walksOfRound[detail::currentRound.load(std::memory_order_relaxed)]),
        locked_(locked || !own.plain) {
    if (locked_) {
      count_.fetch_add(1, std::memory_order_seq_cst);
    } else {
      count_.store(count_.load(std::memory_order_relaxed) + 1, std::memory_order_relaxed);
      std::atomic_signal_fence(std::memory_order_seq_cst);
    }
  }

  std::atomic<uint32_t> &count_;
  bool locked_;
};

class Glance : public Walk {
public:
  Glance() : Walk(false) {}
};

// Call before a glance that is to follow a link found since the last removal.
void expectGlances();

// Returns when every walk that was under way at the call has ended; false if nobody knows, because
// the kernel refused the barrier. One caller at a time, with thread cancellation held back.
bool waitForWalkers();

// True if a walk of this thread is under way, interrupted by a signal. A thread that shares its
// counts does not know; for it, the answer is false.
bool isWalking();

// In a forked child: the threads whose walks the fork cut off do not exist.
void forgetOtherWalks();

} // namespace nls2::locale
