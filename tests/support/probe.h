// Decides what ICU and the heap answer, and watches what the library takes.
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

// The nth call of a function of ICU's by the library fails with `error`. Of the heap's functions,
// "malloc" and "realloc" fail for every block of n bytes; "object" is the size of a
// locale object.
struct Fault {
  std::string function;
  long nth;
  UErrorCode error = U_MEMORY_ALLOCATION_ERROR;
};

// What ICU reports of the process, and what fails. "null" stands for a null pointer.
struct World {
  std::string locale = "en_US";
  std::vector<std::string> codepages{"UTF-8"}; // call by call; the last one stays
  std::vector<Fault> faults;
};
extern World world;

// Every handle of ICU that the library has opened since the call before.
std::vector<const void *> openedHandles();
// How many blocks the program has asked of the heap.
long heapRequests();

} // namespace support
