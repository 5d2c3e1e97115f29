// A memory reserve for ICU. When an allocation fails, ICU 72 follows null pointers in its collation
// loader and deadlocks in its default locale. The reserve lets it go on until requireMemory() ends
// the command.
#pragma once

#include <algorithm>
#include <array>
#include <atomic>
#include <cstddef>
#include <cstdlib>
#include <cstring>
#include <malloc.h>
#include <new>
#include <system_error>
#include <unicode/uclean.h>

namespace nls2::tool {

// Whether an allocation of ICU's has failed. Some of its functions report that as an unknown name,
// or not at all.
inline std::atomic<bool> ranOutOfMemory = false;

// Throws std::bad_alloc if one has, or if the status says so. Call it before reporting an answer:
// without memory a known page seems unknown.
inline void requireMemory(std::error_code status = {}) {
  if (ranOutOfMemory || status == std::errc::not_enough_memory) {
    throw std::bad_alloc();
  }
}

namespace icu_memory {

alignas(std::max_align_t) inline std::array<char, std::size_t{4} << 20> reserve;
inline std::atomic<std::size_t> used = 0;

inline bool isReserved(const void *block) {
  return block >= reserve.data() && block < reserve.data() + reserve.size();
}

inline void *allocate(std::size_t size) {
  if (void *block = std::malloc(size)) {
    return block;
  }
  ranOutOfMemory = true;
  const std::size_t rounded = (size / alignof(std::max_align_t) + 1) * alignof(std::max_align_t);
  std::size_t at = used;
  while (size < reserve.size() && rounded <= reserve.size() - at) {
    if (used.compare_exchange_weak(at, at + rounded)) {
      return reserve.data() + at;
    }
  }
  return nullptr;
}

inline void release(void *block) {
  if (!isReserved(block)) {
    std::free(block);
  }
}

inline void *resize(void *block, std::size_t size) {
  void *resized = isReserved(block) ? nullptr : std::realloc(block, size);
  if (resized == nullptr && (resized = allocate(size)) != nullptr && block != nullptr) {
    const char *bytes = static_cast<char *>(block);
    const std::size_t most = isReserved(block)
                                 ? static_cast<std::size_t>(reserve.data() + reserve.size() - bytes)
                                 : malloc_usable_size(block);
    std::memcpy(resized, block, std::min(size, most));
    release(block);
  }
  return resized;
}

} // namespace icu_memory

// Call it before any other use of ICU.
inline void giveIcuReserve() {
  UErrorCode status = U_ZERO_ERROR;
  u_setMemoryFunctions(
      nullptr, [](const void *, std::size_t size) { return icu_memory::allocate(size); },
      [](const void *, void *block, std::size_t size) { return icu_memory::resize(block, size); },
      [](const void *, void *block) { icu_memory::release(block); }, &status);
}

} // namespace nls2::tool
