// bytes.hpp - text and records as functions take them: any contiguous range of bytes.
#ifndef NLS2_BYTES_HPP
#define NLS2_BYTES_HPP

#include "nls2/detail/common.hpp"

#include <cstddef>
#include <span>
#include <string>
#include <string_view>
#include <type_traits>

namespace nls2 {
inline namespace NLS2_MODE {

namespace detail {

template <class T>
concept character = std::is_same_v<T, char> || std::is_same_v<T, char8_t>;
template <class T>
concept byte_like =
    character<T> || std::is_same_v<T, unsigned char> || std::is_same_v<T, std::byte>;

// A container or view of bytes, or an array of them.
template <class Range>
concept byte_range = requires(Range &range) {
  requires byte_like<std::remove_cvref_t<decltype(*std::data(range))>>;
  static_cast<std::size_t>(std::size(range));
};

template <class Range>
concept readable_bytes =
    byte_range<Range> && !(std::is_array_v<Range> && character<std::remove_all_extents_t<Range>>);

template <class Pointer>
concept character_pointer =
    std::is_same_v<Pointer, const char *> || std::is_same_v<Pointer, char *>;

template <class T>
inline constexpr bool is_string = false;
template <class Unit, class... Others>
inline constexpr bool is_string<std::basic_string<Unit, Others...>> = true;

template <class Range>
concept writable_bytes =
    byte_range<Range> && !is_string<std::remove_cvref_t<Range>> && requires(Range & range) {
  *std::data(range) = *std::data(range);
};

} // namespace detail

// Bytes to read: a literal without its terminator, a pointer to null-terminated characters, or any
// contiguous range of char, unsigned char, std::byte or char8_t. Does not own them.
//
// An array of char that is not a literal does not convert, since only its owner knows whether all
// of it is text: pass std::span(array) for all of it, std::string_view(array) for the text up to a
// null.
class byte_view {
public:
  constexpr byte_view() noexcept = default;
  constexpr byte_view(const void *data, std::size_t size) noexcept : data_(data), size_(size) {}

  template <detail::readable_bytes Range>
  constexpr byte_view(const Range &range) noexcept
      : data_(std::data(range)), size_(std::size(range)) {}

  template <detail::character Unit, std::size_t length>
  consteval byte_view(const Unit (&literal)[length]) noexcept
      : data_(literal), size_(literal[length - 1] == Unit() ? length - 1 : length) {}
  template <detail::character Unit, std::size_t length>
  byte_view(Unit (&array)[length]) = delete;

  template <detail::character_pointer Pointer>
  constexpr byte_view(Pointer text) noexcept : byte_view(std::string_view(text)) {}

  [[nodiscard]] constexpr const void *data() const noexcept { return data_; }
  [[nodiscard]] constexpr std::size_t size() const noexcept { return size_; }

private:
  const void *data_ = nullptr;
  std::size_t size_ = 0;
};

// Room to write to: any contiguous range of such bytes but a string, to which functions append.
// Does not own it.
class byte_room {
public:
  constexpr byte_room(void *data, std::size_t size) noexcept : data_(data), size_(size) {}
  template <detail::writable_bytes Range> // a room itself is none
  // NOLINTNEXTLINE(bugprone-forwarding-reference-overload)
  constexpr byte_room(Range &&range) noexcept : data_(std::data(range)), size_(std::size(range)) {}

  [[nodiscard]] constexpr void *data() const noexcept { return data_; }
  [[nodiscard]] constexpr std::size_t size() const noexcept { return size_; }

private:
  void *data_;
  std::size_t size_;
};

} // namespace NLS2_MODE
} // namespace nls2

#endif
