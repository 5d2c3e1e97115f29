// Makes the heap refuse. Linking it into a program puts its malloc and realloc before the C
// library's.
#pragma once

#include <atomic>
#include <cstddef>

namespace support {

#if defined(__SANITIZE_ADDRESS__) || defined(__SANITIZE_THREAD__)
// A sanitizer brings its own heap, which stays in place.
constexpr bool heapCanRefuse = false;
#else
constexpr bool heapCanRefuse = true;
#endif

// The size that is refused, by default none.
constexpr std::size_t noSize = static_cast<std::size_t>(-1);
inline std::atomic<std::size_t> refusedRealloc{noSize};
inline std::atomic<std::size_t> refusedMalloc{noSize};

// While it lives, every request of this size fails: to realloc, new or moved, or to malloc.
template <std::atomic<std::size_t> &refused>
class FailingRequests {
public:
  explicit FailingRequests(std::size_t size) { refused = size; }
  ~FailingRequests() { refused = noSize; }
  FailingRequests(const FailingRequests &) = delete;
  FailingRequests &operator=(const FailingRequests &) = delete;
};
using FailingReallocs = FailingRequests<refusedRealloc>;
using FailingMallocs = FailingRequests<refusedMalloc>;

} // namespace support
