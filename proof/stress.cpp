// Eight threads call every function, half of them on one shared object, half on objects of their own:
// stress SECONDS [cancel]
//
// With "cancel", threads are cancelled at random at cancellation points, and new ones replace them. Run
// it under the thread sanitizer.

#include "calls.h"
#include "support/dispatch.h"

#include <array>
#include <atomic>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <pthread.h>
#include <random>
#include <vector>

namespace {

using Clock = std::chrono::steady_clock;

constexpr uint32_t german = 0x01140002;
constexpr int threadCount = 8;

std::atomic<bool> stop{false};
std::atomic<long> callsMade{0};
std::atomic<long> wrong{0};
NLS2_Locale *shared = nullptr;
std::vector<std::string> expected;

NLS2_Locale *make() {
  int32_t status = 0;
  return NLS2_GetLocale(german, 819, 0, &status);
}

void expect(bool holds, const char *what) {
  if (!holds && wrong++ == 0) {
    std::fprintf(stderr, "stress: does not hold: %s\n", what);
  }
}

// Calls every function and expects the answer from before the threads began.
void callAll(NLS2_Locale *in) {
  for (size_t i = 0; i < proof::calls().size(); ++i) {
    const proof::Call &call = proof::calls()[i];
    expect(call.make(in) == expected[i], call.text.c_str());
    ++callsMade;
  }
}

// Only calls of the library may be cancelled, because destructors must not be.
void allowCancel(bool isAllowed) {
  pthread_setcancelstate(isAllowed ? PTHREAD_CANCEL_ENABLE : PTHREAD_CANCEL_DISABLE, nullptr);
}

extern "C" void *work(void *argument) {
  const bool owner = argument != nullptr;
  allowCancel(false);
  while (!stop) {
    if (owner) {
      NLS2_Locale *own = make();
      callAll(own);
      NLS2_ReleaseLocale(own);
    } else {
      callAll(shared);
    }
    allowCancel(true);
    pthread_testcancel();
    allowCancel(false);
  }
  return nullptr;
}

pthread_t start(int number) {
  pthread_t thread;
  if (pthread_create(&thread, nullptr, work, number % 2 == 0 ? shared : nullptr) != 0) {
    std::perror("stress: pthread_create");
    std::exit(1);
  }
  return thread;
}

} // namespace

int main(int argc, char **argv) {
  const auto end = Clock::now() + std::chrono::seconds(argc > 1 ? std::atoi(argv[1]) : 10);
  const bool cancelling = argc > 2 && std::strcmp(argv[2], "cancel") == 0;
  support::aroundCall = allowCancel;
  shared = make();
  for (const proof::Call &call : proof::calls()) {
    expected.push_back(call.make(shared));
  }
  std::array<pthread_t, threadCount> threads = {};
  for (int i = 0; i < threadCount; ++i) {
    threads[static_cast<size_t>(i)] = start(i);
  }
  std::mt19937 random(1);
  long cancelled = 0;
  while (Clock::now() < end) {
    const timespec pause = {0, 20'000'000};
    nanosleep(&pause, nullptr);
    if (cancelling) {
      const size_t i = random() % threadCount;
      pthread_cancel(threads[i]);
      pthread_join(threads[i], nullptr);
      threads[i] = start(static_cast<int>(i));
      ++cancelled;
    }
  }
  stop = true;
  for (const pthread_t thread : threads) {
    pthread_join(thread, nullptr);
  }
  std::printf("stress: %ld calls in %d threads, %ld threads cancelled, %ld wrong\n",
              callsMade.load(), threadCount, cancelled, wrong.load());
  return wrong == 0 && callsMade > 0 ? 0 : 1;
}
