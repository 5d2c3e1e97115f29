// The probe on the heap.

#include "support/heap_probe.h"

#include <atomic>
#include <dlfcn.h>

namespace {

constexpr std::size_t none = static_cast<std::size_t>(-1);
std::atomic<std::size_t> refusedSize{none};

} // namespace

namespace support {

FailingReallocs::FailingReallocs(std::size_t size) { refusedSize = size; }
FailingReallocs::~FailingReallocs() { refusedSize = none; }

} // namespace support

#if !defined(__SANITIZE_ADDRESS__) && !defined(__SANITIZE_THREAD__)
extern "C" void *realloc(void *block, std::size_t size) noexcept {
  using Realloc = void *(*)(void *, std::size_t);
  static const auto original = reinterpret_cast<Realloc>(dlsym(RTLD_NEXT, "realloc"));
  return size == refusedSize ? nullptr : original(block, size);
}
#endif
