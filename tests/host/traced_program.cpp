// A program that does what its argument says, for the trace that its environment asks for.

#include "nls2.h"
#include "trc1.h"

#include <cstdio>
#include <cstring>
#include <latch>
#include <thread>

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
  std::thread threads[8];
  std::latch allAreReady(8);
  for (std::thread &thread : threads) {
    const char letter = static_cast<char>('a' + (&thread - threads));
    thread = std::thread([letter, &allAreReady] {
      char text[3001] = {};
      std::memset(text, letter, sizeof text - 1);
      allAreReady.arrive_and_wait();
      for (int i = 0; i < 200; ++i) {
        TRC1_Printf(&anchor, 40, "%s\n", text);
      }
    });
  }
  for (std::thread &thread : threads) {
    thread.join();
  }
  return 0;
}

// What the library's functions see of the settings.
int printFlags() {
  const uint32_t flags = TRC1_Sync(&anchor);
  std::printf("%X %X %u\n", flags, anchor.cachedFlags, anchor.cachedSync);
  return 0;
}

} // namespace

int main(int argc, char **argv) {
  const struct {
    const char *name;
    int (*run)();
  } actions[] = {{"library", callLibrary},
                 {"host", callHost},
                 {"threads", callFromThreads},
                 {"flags", printFlags}};
  for (const auto &action : actions) {
    if (argc == 2 && std::strcmp(argv[1], action.name) == 0) {
      return action.run();
    }
  }
  return 2;
}
