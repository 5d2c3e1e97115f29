// Whether ICU ran out of memory.

#include "memory.h"

#include <atomic>
#include <cstdlib>
#include <new>
#include <unicode/uclean.h>

namespace nls2::tool {

namespace {

std::atomic<bool> ranOut = false;

void *noted(void *block) {
  if (block == nullptr) {
    ranOut = true;
  }
  return block;
}

} // namespace

void watchMemory() {
  UErrorCode status = U_ZERO_ERROR;
  u_setMemoryFunctions(
      nullptr, [](const void *, std::size_t size) { return noted(std::malloc(size)); },
      [](const void *, void *block, std::size_t size) { return noted(std::realloc(block, size)); },
      [](const void *, void *block) { std::free(block); }, &status);
}

void requireMemory() {
  if (ranOut) {
    throw std::bad_alloc();
  }
}

} // namespace nls2::tool
