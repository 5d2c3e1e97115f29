// The default lock service: a blocking lock in the first word of the caller's 28 bytes.

#include "sys1.h"

#include <cstdint>
#include <linux/futex.h>
#include <sys/syscall.h>
#include <unistd.h>

namespace {

// The word's values. A holder that finds `contended` at its release has a waiter to wake; one that
// finds `held` saves the system call.
enum LockState : uint32_t { unlocked = 0, held = 1, contended = 2 };

#if defined(SYS_futex)
constexpr long futexCall = SYS_futex;
#else
constexpr long futexCall = SYS_futex_time64;
#endif

void waitWhileContended(uint32_t *word) {
  syscall(futexCall, word, FUTEX_WAIT_PRIVATE, contended, nullptr, nullptr, 0);
}

void wakeOne(uint32_t *word) {
  syscall(futexCall, word, FUTEX_WAKE_PRIVATE, 1, nullptr, nullptr, 0);
}

} // namespace

extern "C" void SYS1_GetLock(void *lock) {
  auto *word = static_cast<uint32_t *>(lock);
  uint32_t expected = unlocked;
  if (__atomic_compare_exchange_n(word, &expected, held, false, __ATOMIC_ACQUIRE,
                                  __ATOMIC_RELAXED)) {
    return;
  }
  while (__atomic_exchange_n(word, contended, __ATOMIC_ACQUIRE) != unlocked) {
    waitWhileContended(word);
  }
}

extern "C" void SYS1_ReleaseLock(void *lock) {
  auto *word = static_cast<uint32_t *>(lock);
  if (__atomic_exchange_n(word, unlocked, __ATOMIC_RELEASE) == contended) {
    wakeOne(word);
  }
}
