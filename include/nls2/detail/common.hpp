// common.hpp - what the parts of the C++ interface share; not for programs.
#ifndef NLS2_DETAIL_COMMON_HPP
#define NLS2_DETAIL_COMMON_HPP

#if __cplusplus < 202002L
#error "nls2.hpp needs C++20: compile with -std=c++20 or later"
#include <nls2_needs_cxx20> // there is none: the compiler stops here
#endif

#include "nls2.h"
#include "nls2_fields.h"

#include <cstddef>
#include <cstdint>
#include <string_view>
#include <type_traits>
#include <utility>

// Parts of a program that are compiled with and without exceptions see different functions, so
// these have different names for the linker.
#if defined(__cpp_exceptions)
#define NLS2_HAS_EXCEPTIONS 1
#define NLS2_MODE with_exceptions
#define NLS2_MAY_OMIT = {}
#else
#define NLS2_HAS_EXCEPTIONS 0
#define NLS2_MODE without_exceptions
#define NLS2_MAY_OMIT
#endif

namespace nls2 {
inline namespace NLS2_MODE {
namespace detail {

static_assert(std::is_same_v<UChar, char16_t>, "ICU must have char16_t for its UTF-16 units");

inline constexpr std::size_t max_length = 0x7FFFFFFF; // of lengths with 32 bits
inline constexpr std::int32_t too_long = 31;          // U_INPUT_TOO_LONG_ERROR, new in ICU 68

constexpr std::int32_t to_int32(std::size_t length) noexcept {
  return static_cast<std::int32_t>(length < max_length ? length : max_length);
}

constexpr std::int64_t to_int64(std::size_t length) noexcept {
  const std::uint64_t wide = length; // where size_t has 32 bits, compilers warn of the comparison
  return wide <= INT64_MAX ? static_cast<std::int64_t>(wide) : INT64_MAX;
}

// Owns a handle of a C interface and closes it by `close`. Move-only; null owns nothing.
template <class Handle, auto close>
class owner {
public:
  constexpr owner() noexcept = default;
  constexpr explicit owner(Handle *owned) noexcept : owned_(owned) {}
  owner(owner &&other) noexcept : owned_(other.release()) {}
  owner &operator=(owner &&other) noexcept {
    reset(other.release());
    return *this;
  }
  ~owner() { reset(); }

  [[nodiscard]] constexpr Handle *get() const noexcept { return owned_; }
  constexpr explicit operator bool() const noexcept { return owned_ != nullptr; }
  // Gives up ownership.
  [[nodiscard]] Handle *release() noexcept { return std::exchange(owned_, nullptr); }
  // Closes the handle and owns another one, or none.
  void reset(Handle *owned = nullptr) noexcept {
    if (Handle *old = std::exchange(owned_, owned); old != nullptr && old != owned) {
      close(old);
    }
  }

private:
  Handle *owned_ = nullptr;
};

// A name or path, null-terminated on the stack. Its status is 0; NLS2_ERR_INVALID_PARAMETER for an
// empty one and for one with a null inside, at which a C function would stop; or too_long.
template <std::size_t size>
class terminated {
public:
  explicit terminated(std::string_view text) noexcept {
    if (text.empty() || text.find('\0') != text.npos) {
      status_ = NLS2_ERR_INVALID_PARAMETER;
    } else if (text.size() >= size) {
      status_ = too_long;
    } else {
      text_[text.copy(text_, text.size())] = '\0';
    }
  }

  [[nodiscard]] std::int32_t status() const noexcept { return status_; }
  [[nodiscard]] const char *c_str() const noexcept { return text_; }

private:
  std::int32_t status_ = 0;
  char text_[size];
};

} // namespace detail
} // namespace NLS2_MODE
} // namespace nls2

#endif
