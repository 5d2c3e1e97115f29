// What every exported function shares: no exception leaves the library, and arguments are checked.
#pragma once

#include "nls2_fields.h"

#include <new>
#include <stdexcept>
#include <unicode/utypes.h>

namespace zelfields {

// Runs the body of an exported function, which returns a status. The only exceptions in the library
// are those of failed allocations: std::bad_alloc, and std::length_error for impossible sizes.
template <class Body>
int32_t guarded(Body body) noexcept {
  try {
    return body();
  } catch (const std::bad_alloc &) {
    return NLS2_ERR_NO_MEMORY;
  } catch (const std::length_error &) {
    return NLS2_ERR_NO_MEMORY;
  }
}

// ICU's status as one of ours.
inline int32_t statusOf(UErrorCode error) noexcept {
  return error == U_MEMORY_ALLOCATION_ERROR ? int32_t{NLS2_ERR_NO_MEMORY} : int32_t{error};
}

// Whether a struct of the caller's is there, and as large as this version of it.
template <class Struct>
bool isWhole(const Struct *given) noexcept {
  return given != nullptr && given->size >= sizeof(Struct);
}

// Whether `bytes` can lie at an address, which may be null for none.
inline bool isRange(const void *address, int64_t bytes) noexcept {
  return bytes == 0 || (bytes > 0 && address != nullptr);
}

} // namespace zelfields
