// The probe on the heap.

#include "support/heap_probe.h"

#include <atomic>
#include <dlfcn.h>

namespace {

constexpr std::size_t none = static_cast<std::size_t>(-1);
std::atomic<std::size_t> refusedSize{none};
std::atomic<std::size_t> refusedMalloc{none};

} // namespace

namespace support {

FailingReallocs::FailingReallocs(std::size_t size) { refusedSize = size; }
FailingReallocs::~FailingReallocs() { refusedSize = none; }
FailingMallocs::FailingMallocs(std::size_t size) { refusedMalloc = size; }
FailingMallocs::~FailingMallocs() { refusedMalloc = none; }

} // namespace support

#if !defined(__SANITIZE_ADDRESS__) && !defined(__SANITIZE_THREAD__)
extern "C" void *realloc(void *block, std::size_t size) noexcept {
  using Realloc = void *(*)(void *, std::size_t);
  static const auto original = reinterpret_cast<Realloc>(dlsym(RTLD_NEXT, "realloc"));
  return size == refusedSize ? nullptr : original(block, size);
}

extern "C" void *malloc(std::size_t size) noexcept {
  using Malloc = void *(*)(std::size_t);
  static const auto original = reinterpret_cast<Malloc>(dlsym(RTLD_NEXT, "malloc"));
  return size == refusedMalloc ? nullptr : original(size);
}
#endif
