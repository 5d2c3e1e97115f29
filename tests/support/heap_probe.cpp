// The probe on the heap.

#include "support/heap_probe.h"

#include <dlfcn.h>

#if !defined(__SANITIZE_ADDRESS__) && !defined(__SANITIZE_THREAD__)
extern "C" void *realloc(void *block, std::size_t size) noexcept {
  using Realloc = void *(*)(void *, std::size_t);
  static const auto original = reinterpret_cast<Realloc>(dlsym(RTLD_NEXT, "realloc"));
  return size == support::refusedRealloc ? nullptr : original(block, size);
}

extern "C" void *malloc(std::size_t size) noexcept {
  using Malloc = void *(*)(std::size_t);
  static const auto original = reinterpret_cast<Malloc>(dlsym(RTLD_NEXT, "malloc"));
  return size == support::refusedMalloc ? nullptr : original(size);
}
#endif
