// A program that prints its trace flags, and does what its argument says: for the trace that its
// environment asks for.

#include "nls2.h"
#include "trc1.h"

#include <cstdio>
#include <latch>
#include <string>
#include <thread>
#include <unistd.h>
#include <vector>

namespace {

TRC1_UnitBlock unit = {};
uint32_t syncWord = 7;
TRC1_EntryBlock anchor = {&unit, "Example", 7, 30, &syncWord, TRC1_ENTRY_EXPORTED, 0, 0, {0, 0}};

int callLibrary() {
  int32_t status = 0;
  return NLS2_MapWindowsNameToCCSID("windows-936", &status) == 936 ? 0 : 1;
}

// Whatever the library may ask for, asked directly.
int callHost() {
  TRC1_Printf(&anchor, 31, "%s, %d\n", "two\nlines", -5);
  TRC1_Event(&anchor, 32, TRC1_EVENT_EXIT_VALUE, 0xFFFFFFFDU);
  TRC1_Event(&anchor, 33, TRC1_EVENT_EXIT);
  TRC1_Dump(&anchor, 34, "\x00\x7F\xFF", 3, 0);
  return 0;
}

int callFromThreads() {
  std::latch allAreReady(8);
  std::vector<std::jthread> threads;
  for (const char letter : std::string("abcdefgh")) {
    threads.emplace_back([letter, &allAreReady] {
      const std::string text(3000, letter);
      allAreReady.arrive_and_wait();
      for (int i = 0; i < 200; ++i) {
        TRC1_Printf(&anchor, 40, "%s\n", text.c_str());
      }
    });
  }
  return 0;
}

// A thread that is cancelled while it writes a line leaves the stream to the others.
int callCancelled() {
  alarm(30); // a stream that stays locked would make the next line wait for ever
  std::jthread([] {
    pthread_cancel(pthread_self());
    TRC1_Printf(&anchor, 50, "held back\n");
    pthread_testcancel();
    TRC1_Printf(&anchor, 51, "not cancelled\n");
  }).join();
  TRC1_Printf(&anchor, 52, "next\n");
  return 0;
}

} // namespace

int main(int, char **argv) {
  const uint32_t flags = TRC1_Sync(&anchor);
  std::printf("%X %X %u\n", flags, anchor.cachedFlags, anchor.cachedSync);
  std::fflush(stdout);
  const std::string action = argv[1];
  return action == "library"   ? callLibrary()
         : action == "host"    ? callHost()
         : action == "threads" ? callFromThreads()
                               : callCancelled();
}
