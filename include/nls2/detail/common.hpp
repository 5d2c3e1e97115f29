// common.hpp - what the parts of the C++ interface share; not for programs.
#ifndef NLS2_DETAIL_COMMON_HPP
#define NLS2_DETAIL_COMMON_HPP

#include "nls2/error.hpp"

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <limits>
#include <string>
#include <string_view>
#include <type_traits>
#include <utility>

namespace nls2::detail {

static_assert(std::is_same_v<UChar, char16_t>, "ICU must have char16_t for its UTF-16 units");

// The longest text that a signed 32-bit length measures, and the status of a longer one.
inline constexpr std::size_t max_length = std::numeric_limits<std::int32_t>::max();
inline constexpr std::int32_t too_long = 31; // U_INPUT_TOO_LONG_ERROR, new in ICU 68

constexpr std::int32_t to_int32(std::size_t length) noexcept {
  return static_cast<std::int32_t>(std::min(length, max_length));
}

// The C functions want a pointer to something even for an empty text.
template <class Unit>
inline constexpr Unit nothing[1] = {};
template <class Unit>
constexpr const Unit *data_of(std::basic_string_view<Unit> text) noexcept {
  return text.data() != nullptr ? text.data() : nothing<Unit>;
}

// Owns a handle of a C interface, which `close` gives back. Move-only; null owns nothing.
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

  constexpr Handle *get() const noexcept { return owned_; }
  constexpr explicit operator bool() const noexcept { return owned_ != nullptr; }
  // Hands the handle to the caller.
  [[nodiscard]] Handle *release() noexcept { return std::exchange(owned_, nullptr); }
  // Gives the handle back and owns another one, or none.
  void reset(Handle *owned = nullptr) noexcept {
    if (Handle *old = std::exchange(owned_, owned); old != nullptr && old != owned) {
      close(old);
    }
  }

private:
  Handle *owned_ = nullptr;
};

// A name or path, null-terminated on the stack. Its status is 0; NLS2_ERR_INVALID_PARAMETER where a
// null stands inside, at which a C function would stop; or too_long.
template <std::size_t size>
class terminated {
public:
  explicit terminated(std::string_view text) noexcept {
    if (text.find('\0') != text.npos) {
      status_ = NLS2_ERR_INVALID_PARAMETER;
    } else if (text.size() >= size) {
      status_ = too_long;
    } else {
      text_[text.copy(text_, text.size())] = '\0';
    }
  }

  std::int32_t status() const noexcept { return status_; }
  const char *c_str() const noexcept { return text_; }

private:
  std::int32_t status_ = 0;
  char text_[size];
};

// Fills a string by `fill`, which gets the string to write to and returns the length; more room is
// made until the output fits. `length` is the input's.
template <class Unit, class Fill>
std::basic_string<Unit> grown(std::size_t length, std::error_code &error, Fill fill) {
  std::basic_string<Unit> out;
  const std::size_t most = std::min(max_length, out.max_size());
  if (length > most) {
    error = make_status(too_long);
    return out;
  }
  for (std::size_t room = std::min(2 * length + 16, most);; room = std::min(2 * room, most)) {
    out.resize(room);
    const std::size_t filled = fill(out);
    if (error.value() != U_BUFFER_OVERFLOW_ERROR || room == most) {
      if (error.value() == U_BUFFER_OVERFLOW_ERROR) {
        error = make_status(too_long);
      }
      out.resize(filled);
      return out;
    }
  }
}

#if NLS2_HAS_EXCEPTIONS
// Calls the form that takes an error code, and throws what it reports.
template <class Call>
auto or_throw(const char *what, Call call) {
  std::error_code error;
  if constexpr (std::is_void_v<decltype(call(error))>) {
    call(error);
    if (error) {
      throw nls2::error(error, what);
    }
  } else {
    auto result = call(error);
    if (error) {
      throw nls2::error(error, what);
    }
    return result;
  }
}
#endif

} // namespace nls2::detail

#endif
