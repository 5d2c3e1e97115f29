// Functions in front of the heap's and ICU's, which a program lets fail and counts. Linking them into
// a program, or loading them before it, puts them before libc's and ICU's own.
#pragma once

#include <cstddef>
#include <unicode/utypes.h>

namespace interpose {

struct Call {
  const char *function; // "malloc", "ucnv_open"
  std::size_t size;     // how many bytes a function of the heap is to give; 0 for ICU's
  const void *caller;   // the address it returns to
};

// The program defines these two. Whether this call fails: a function of the heap's has no `error`, for
// one of ICU's it may be set.
bool refuses(const Call &call, UErrorCode *error);
// Somebody has opened a handle of ICU's, or null if that failed.
void opened(const void *handle);

// Whether a call comes from libzelnls2 itself.
bool isLibrarys(const void *caller);

// Blocks that the library has asked for and not given back, and handles of ICU that are open.
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
