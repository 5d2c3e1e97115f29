// Makes the heap refuse. Linking it into a program puts its malloc and realloc before the C
// library's.
#pragma once

#include <cstddef>

namespace support {

#if defined(__SANITIZE_ADDRESS__) || defined(__SANITIZE_THREAD__)
// A sanitizer brings its own heap, which stays in place.
constexpr bool heapCanRefuse = false;
#else
constexpr bool heapCanRefuse = true;
#endif

// While it lives, every realloc of this size, new or moved, fails.
class FailingReallocs {
public:
  explicit FailingReallocs(std::size_t size);
  ~FailingReallocs();
  FailingReallocs(const FailingReallocs &) = delete;
  FailingReallocs &operator=(const FailingReallocs &) = delete;
};

// The same for every malloc of this size.
class FailingMallocs {
public:
  explicit FailingMallocs(std::size_t size);
  ~FailingMallocs();
  FailingMallocs(const FailingMallocs &) = delete;
  FailingMallocs &operator=(const FailingMallocs &) = delete;
};

} // namespace support
