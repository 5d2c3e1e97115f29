// The default lock service: a blocking lock in the first word of the caller's 28 bytes.

#include "sys1.h"

#include <cstdint>
#include <linux/futex.h>
#include <sys/syscall.h>
#include <unistd.h>

namespace {

// The word's values. A holder that finds `Contended` at its release has somebody to wake; one that
// finds `Held` saves the system call.
enum LockState : uint32_t { Free = 0, Held = 1, Contended = 2 };

#if defined(SYS_futex)
constexpr long FutexCall = SYS_futex;
#else
constexpr long FutexCall = SYS_futex_time64;
#endif

void waitWhileContended(uint32_t *word) {
  syscall(FutexCall, word, FUTEX_WAIT_PRIVATE, Contended, nullptr, nullptr, 0);
}

void wakeOne(uint32_t *word) {
  syscall(FutexCall, word, FUTEX_WAKE_PRIVATE, 1, nullptr, nullptr, 0);
}

} // namespace

extern "C" void SYS1_GetLock(void *lock) {
  auto *word = static_cast<uint32_t *>(lock);
  uint32_t expected = Free;
  if (__atomic_compare_exchange_n(word, &expected, Held, false, __ATOMIC_ACQUIRE,
                                  __ATOMIC_RELAXED)) {
    return;
  }
  while (__atomic_exchange_n(word, Contended, __ATOMIC_ACQUIRE) != Free) {
    waitWhileContended(word);
  }
}

extern "C" void SYS1_ReleaseLock(void *lock) {
  auto *word = static_cast<uint32_t *>(lock);
  if (__atomic_exchange_n(word, Free, __ATOMIC_RELEASE) == Contended) {
    wakeOne(word);
  }
}
