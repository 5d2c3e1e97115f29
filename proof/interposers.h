// Replaces functions of the heap and of ICU, to count them and let them fail. A program links these
// definitions or preloads them.
#pragma once

#include <cstddef>
#include <unicode/utypes.h>

namespace interpose {

struct Call {
  const char *function; // "malloc", "ucnv_open"
  std::size_t size;     // bytes requested from the heap; 0 for ICU
  const void *caller;   // the return address
};

// The program defines these two. The first decides whether a call fails. For the heap `error` is null;
// for ICU it is where the status goes.
bool refuses(const Call &call, UErrorCode *error);
// An ICU handle was opened; null if that failed.
void opened(const void *handle);

// Whether libzelnls2 made a call.
bool isLibrarys(const void *caller);

// Blocks that the library allocated and did not free, and open ICU handles.
struct Held {
  long blocks = 0;
  long handles = 0;

  friend bool operator==(const Held &, const Held &) = default;
};
Held held();

#if defined(__SANITIZE_ADDRESS__) || defined(__SANITIZE_THREAD__) || defined(FOREIGN_HEAP)
constexpr bool heapIsOurs = false; // a sanitizer or Valgrind brings its own
#else
constexpr bool heapIsOurs = true;
#endif

} // namespace interpose
