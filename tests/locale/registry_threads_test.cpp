// The registry of locale objects: under many threads, across fork, and what a thread remembers.
//
// ZELNLS2_TEST_SECONDS sets how long the threads run, 1 by default. The faults that these tests are
// for show as a crash or, under the sanitizers, as a report.

#include "nls2.h"
#include "sys1.h"

#include <algorithm>
#include <atomic>
#include <chrono>
#include <csignal>
#include <cstdlib>
#include <functional>
#include <gtest/gtest.h>
#include <string>
#include <sys/wait.h>
#include <thread>
#include <unistd.h>
#include <utility>
#include <vector>

namespace {

NLS2_Locale *make() {
  int32_t status = 0;
  return NLS2_GetLocale(0x03480001, 819, 0, &status);
}

const NLS2_Locale never = {};

// One that this thread remembers.
NLS2_Locale *makeAndValidate() {
  NLS2_Locale *object = make();
  for (int i = 0; i < 100; ++i) {
    EXPECT_EQ(NLS2_ValidateLocale(object), 0);
  }
  EXPECT_EQ(NLS2_ValidateLocale(nullptr), NLS2_ERR_INVALID_LOCALE);
  return object;
}

// Threads that repeat their step until the object goes out of scope.
class Threads {
public:
  Threads(int count, const std::function<void()> &step) {
    for (int i = 0; i < count; ++i) {
      threads_.emplace_back([step](const std::stop_token &stop) {
        while (!stop.stop_requested()) {
          step();
        }
      });
    }
  }
  ~Threads() { // the first is waited for when all of them stop
    std::ranges::for_each(threads_, &std::jthread::request_stop);
  }

private:
  std::vector<std::jthread> threads_;
};

// Makes some objects, uses them, and gives them back in another order; counts faults. What it asks
// about a released pointer may be answered either way, since its memory may be another object.
void liveAndDie(std::atomic<long> &faults) {
  NLS2_Locale *objects[5];
  std::ranges::generate(objects, make);
  for (const int i : {2, 0, 4, 1, 3}) {
    int32_t status = 0;
    faults += NLS2_ValidateLocale(objects[i]) != 0;
    faults += NLS2_GetLocaleCodepageId(objects[i], &status) != 819;
    faults += NLS2_ReleaseLocale(objects[i]) != 0;
    NLS2_ValidateLocale(objects[i]);
  }
}

TEST(Registry, OwnersAndValidatorsDoNotDisturbEachOther) {
  const char *seconds = std::getenv("ZELNLS2_TEST_SECONDS");
  for (const int owners : {4, 70}) { // 70: more than stripes
    std::atomic<long> faults{0};
    NLS2_Locale *const first = make();
    {
      const Threads releasing(owners, [&] { liveAndDie(faults); });
      const Threads validating(4, [&] {
        faults += NLS2_ValidateLocale(first) != 0;
        NLS2_ValidateLocale(&never); // walks the whole list
      });
      std::this_thread::sleep_for(std::chrono::seconds(seconds ? std::atoi(seconds) : 1));
    }
    EXPECT_EQ(faults, 0) << "a live object was called invalid, or not released";
    EXPECT_EQ(NLS2_ReleaseLocale(first), 0);
    EXPECT_EQ(pLocaleObjectList, nullptr) << "all were released";
  }
}

// Only what the library promises: the validating threads hold no lock of the library's or of ICU's.
bool worksInChild() {
  alarm(20); // a child that hangs is a failure
  NLS2_Locale *own = make();
  return own != nullptr && NLS2_ValidateLocale(own) == 0 && NLS2_ReleaseLocale(own) == 0 &&
         NLS2_ValidateLocale(own) == NLS2_ERR_INVALID_LOCALE;
}

void expectToWork(pid_t child, const std::string &what) {
  if (child == 0) {
    _exit(worksInChild() ? 0 : 1);
  }
  int status = -1;
  ASSERT_EQ(waitpid(child, &status, 0), child);
  ASSERT_EQ(status, 0) << what;
}

TEST(Registry, AChildForkedAmidValidationsWorks) {
  std::vector<NLS2_Locale *> list(200); // walks long enough that a fork finds some under way
  std::ranges::generate(list, make);
  const Threads validating(3, [&] { NLS2_ValidateLocale(list.back()); });
  for (int round = 0; round < 8; ++round) {
    expectToWork(fork(), "round " + std::to_string(round));
  }
  for (NLS2_Locale *object : list) {
    ASSERT_EQ(NLS2_ReleaseLocale(object), 0);
  }
}

TEST(Registry, AForkWaitsForWhoeverChangesTheList) {
  std::atomic<bool> held{false};
  std::atomic<bool> forked{false};
  const std::jthread holder([&] {
    SYS1_GetLock(&LocaleObjectList_Lock);
    held = true;
    held.notify_one();
    std::this_thread::sleep_for(std::chrono::milliseconds(20));
    SYS1_ReleaseLock(&LocaleObjectList_Lock);
    forked.wait(false);
  });
  held.wait(false);
  expectToWork(fork(), "while another thread holds the lock");
  forked = true;
  forked.notify_one();
}

#if defined(__x86_64__) && !defined(__SANITIZE_ADDRESS__) && !defined(__SANITIZE_THREAD__)
std::function<void(int)> atInstruction; // its argument counts from 1
std::atomic<int> instructions;

// Runs a handler at each of a function's instructions, as a signal's.
void singleStep(const std::function<void()> &function, const std::function<void(int)> &handler) {
  atInstruction = handler;
  instructions = 0;
  std::signal(SIGTRAP, [](int) { atInstruction(++instructions); });
  asm volatile(
      "lea -128(%%rsp), %%rsp; pushfq; orq $0x100, (%%rsp); popfq; lea 128(%%rsp), %%rsp" ::
          : "memory", "cc");
  function();
  asm volatile(
      "lea -128(%%rsp), %%rsp; pushfq; andq $-0x101, (%%rsp); popfq; lea 128(%%rsp), %%rsp" ::
          : "memory", "cc");
}

TEST(Registry, AChildForkedByASignalHandlerAmidAWalkWorks) {
  NLS2_Locale *object = make();
  for (int at = 20; at < 80; at += 2) {
    pid_t child = -1;
    singleStep([&] { NLS2_ValidateLocale(&never); },
               [&](int instruction) { child = instruction == at ? fork() : child; });
    if (child >= 0) {
      expectToWork(child, "instruction " + std::to_string(at));
    }
  }
  EXPECT_EQ(NLS2_ReleaseLocale(object), 0);
}

TEST(Remembered, IsRightInASignalHandlerAtAnyInstruction) {
  NLS2_Locale *const head = make();
  NLS2_Locale *const released = makeAndValidate();
  NLS2_Locale *const object = make();
  std::jthread([=] { EXPECT_EQ(NLS2_ReleaseLocale(released), 0); }).join();
  int wrong = 0;
  const auto handler = [&](int instruction) {
    wrong += NLS2_ValidateLocale(released) == 0;
    wrong += instruction > 1000 && NLS2_ValidateLocale(head) != 0; // remembers in the handler, too
  };
  const auto validate = [&] {
    for (int i = 0; i < 40; ++i) {
      wrong += NLS2_ValidateLocale(object) != 0;
    }
  };
  singleStep(validate, handler);
  EXPECT_EQ(wrong, 0) << "in " << instructions << " instructions";
  EXPECT_EQ(NLS2_ReleaseLocale(head) | NLS2_ReleaseLocale(object), 0);
}
#endif

// There is another object at the head, so that the head does not give a removal away.
TEST(Remembered, IsForgottenWhenAnotherThreadReleasesIt) {
  NLS2_Locale *const head = make();
  NLS2_Locale *object = makeAndValidate();
  std::jthread([object] { EXPECT_EQ(NLS2_ReleaseLocale(object), 0); }).join();
  EXPECT_EQ(NLS2_ValidateLocale(object), NLS2_ERR_INVALID_LOCALE);
  EXPECT_EQ(NLS2_ReleaseLocale(head), 0);
}

// More objects than a thread remembers, each valid until its own release and not after.
TEST(Remembered, IsEachOfManyUntilItsOwnRelease) {
  NLS2_Locale *const head = make();
  std::vector<NLS2_Locale *> objects(9);
  std::ranges::generate(objects, makeAndValidate);
  for (std::size_t released = 0; released < objects.size(); ++released) {
    EXPECT_EQ(NLS2_ReleaseLocale(objects[released]), 0);
    for (std::size_t i = 0; i < objects.size(); ++i) {
      EXPECT_EQ(NLS2_ValidateLocale(objects[i]), i <= released ? NLS2_ERR_INVALID_LOCALE : 0)
          << i << " after the release of " << released;
    }
  }
  EXPECT_EQ(NLS2_ReleaseLocale(head), 0);
}

// In this thread and in one that remembers it as well.
TEST(Remembered, IsNotLiveWhileItIsOffTheList) {
  NLS2_Locale *const objects[] = {make(), make(), make(), make()};
  for (const int taken : {1, 2, 3, 0}) {
    NLS2_Locale *&link = taken == 0 ? pLocaleObjectList : objects[taken - 1]->pNext;
    const auto validate = [&] { return NLS2_ValidateLocale(objects[taken]); };
    std::atomic<bool> offList{false};
    std::jthread other([&] {
      while (validate() == 0) {
      }
      EXPECT_TRUE(offList);
    });
    for (int i = 0; i < 100'000; ++i) {
      ASSERT_EQ(validate(), 0) << taken;
    }
    offList = true;
    __atomic_store_n(&link, objects[taken]->pNext, __ATOMIC_SEQ_CST);
    EXPECT_EQ(validate(), NLS2_ERR_INVALID_LOCALE) << taken;
    other.join();
    link = objects[taken];
    EXPECT_EQ(validate(), 0) << taken;
  }
  for (NLS2_Locale *object : objects) {
    EXPECT_EQ(NLS2_ReleaseLocale(object), 0);
  }
}

TEST(Remembered, IsForgottenWhileTheListIsSetAside) {
  NLS2_Locale *const head = make();
  NLS2_Locale *object = makeAndValidate();
  NLS2_Locale *list = std::exchange(pLocaleObjectList, nullptr);
  EXPECT_EQ(NLS2_ValidateLocale(object), NLS2_ERR_INVALID_LOCALE);
  pLocaleObjectList = list;
  EXPECT_EQ(NLS2_ValidateLocale(object), 0);
  EXPECT_EQ(NLS2_ReleaseLocale(object) | NLS2_ReleaseLocale(head), 0);
}

} // namespace
