// Decides what ICU and the heap answer, watches what the library takes and gives back. Linking it
// into a program puts its functions before ICU's and the C library's own.
#pragma once

#include <string>
#include <unicode/utypes.h>
#include <vector>
#if defined(__SANITIZE_ADDRESS__)
#include <sanitizer/lsan_interface.h>
#endif

namespace support {

#if defined(__SANITIZE_ADDRESS__) || defined(__SANITIZE_THREAD__) || defined(FOREIGN_HEAP)
constexpr bool heapIsOurs = false; // a sanitizer or Valgrind brings its own
#else
constexpr bool heapIsOurs = true;
#endif
#if defined(__SANITIZE_ADDRESS__)
using MeantLeak = __lsan::ScopedDisabler;
constexpr std::size_t canaries = 0; // the sanitizer watches a block's end
#else
struct MeantLeak {};
constexpr std::size_t canaries = 8;
#endif

// The nth call of a function of ICU's fails with `error`. Of the heap's functions, "realloc" and
// "malloc" fail for every block of n bytes; "object" stands for those of a locale object.
struct Fault {
  std::string function;
  long nth;
  UErrorCode error = U_MEMORY_ALLOCATION_ERROR;
};

// What ICU says of the process, and what fails. "null" stands for a null pointer.
struct World {
  std::string locale = "en_US";
  std::vector<std::string> codepages{"UTF-8"}; // call by call; the last one stays
  std::vector<Fault> faults;
};
extern World world;

int openConverters();
// Every converter that was opened since the call before.
std::vector<const void *> openedConverters();
// Blocks that came from realloc and were not given back.
int openBlocks();

} // namespace support
