// What a translation reads, and where its output goes.
#pragma once

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <string_view>

namespace zelfields {

// The bytes of a field. ICU refuses null pointers, also to nothing. A length that no address space
// has is cut to one that no field may have.
inline std::string_view textOf(const void *bytes, int64_t length) {
  return {length != 0 ? static_cast<const char *>(bytes) : "",
          static_cast<std::size_t>(std::min(static_cast<uint64_t>(length), uint64_t{SIZE_MAX}))};
}

// `size` bytes from `begin` on.
struct Room {
  char *begin;
  int64_t size;

  // However much room a caller claims, it ends before the address space does.
  static Room of(void *begin, int64_t size) {
    static char nowhere;
    begin = size != 0 ? begin : &nowhere;
    const uint64_t beforeEnd = UINTPTR_MAX - reinterpret_cast<uintptr_t>(begin);
    const uint64_t most = std::min<uint64_t>(beforeEnd, PTRDIFF_MAX);
    return {static_cast<char *>(begin),
            static_cast<int64_t>(std::min(static_cast<uint64_t>(size), most))};
  }
  Room first(int64_t bytes) const { return {begin, std::min(size, bytes)}; }
};

} // namespace zelfields
