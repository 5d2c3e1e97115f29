// Lets ICU and the heap fail, sets the process's defaults, and watches what the library opens.
#pragma once

#include "proof/interposers.h"

#include <string>
#include <vector>
#if defined(__SANITIZE_ADDRESS__)
#include <sanitizer/lsan_interface.h>
#endif

namespace support {

#if defined(__SANITIZE_ADDRESS__)
using MeantLeak = __lsan::ScopedDisabler;
#else
struct MeantLeak {};
#endif

// The library's nth call of an ICU function fails with `error`. "malloc" and "realloc" fail for every
// block of n bytes; in case files "object" is the size of a locale object.
struct Fault {
  std::string function;
  long nth;
  UErrorCode error = U_MEMORY_ALLOCATION_ERROR;
};

// The defaults that ICU reports, and the calls that fail. "null" is a null pointer.
struct World {
  std::string locale = "en_US";
  std::vector<std::string> codepages{"UTF-8"}; // one for each call; the last one is repeated
  std::vector<Fault> faults;
};
extern World world;

// All ICU handles opened since the last call of this function.
std::vector<const void *> openedHandles();
// How many blocks the program has requested from the heap.
long heapRequests();

} // namespace support
