// Whether ICU ran out of memory: some of its functions report that as a name that is unknown, or not
// at all.
#pragma once

#include <atomic>
#include <cstdlib>
#include <new>
#include <unicode/uclean.h>

namespace nls2::tool {

inline std::atomic<bool> ranOutOfMemory = false; // a request of ICU's failed

// Must come before any other use of ICU.
inline void watchMemory() {
  static constexpr auto noted = [](void *block) {
    if (block == nullptr) {
      ranOutOfMemory = true;
    }
    return block;
  };
  UErrorCode status = U_ZERO_ERROR;
  u_setMemoryFunctions(
      nullptr, [](const void *, std::size_t size) { return noted(std::malloc(size)); },
      [](const void *, void *block, std::size_t size) { return noted(std::realloc(block, size)); },
      [](const void *, void *block) { std::free(block); }, &status);
}

// Throws std::bad_alloc where a request of ICU's has failed. To be called before an answer is given.
inline void requireMemory() {
  if (ranOutOfMemory) {
    throw std::bad_alloc();
  }
}

} // namespace nls2::tool
