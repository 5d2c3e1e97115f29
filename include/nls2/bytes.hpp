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
inline constexpr bool is_character = std::is_same_v<T, char> || std::is_same_v<T, char8_t>;

template <class Pointer>
concept bytes_pointer = std::is_pointer_v<Pointer> &&
    (is_character<std::remove_cv_t<std::remove_pointer_t<Pointer>>> ||
     std::is_same_v<std::remove_cv_t<std::remove_pointer_t<Pointer>>, unsigned char> ||
     std::is_same_v<std::remove_cv_t<std::remove_pointer_t<Pointer>>, std::byte>);

// A container or view of bytes, or an array of them.
template <class Range>
concept byte_range = requires(Range &range) {
  { std::data(range) } -> bytes_pointer;
  { std::size(range) } -> std::convertible_to<std::size_t>;
};

template <class Range>
inline constexpr bool is_character_array =
    std::is_array_v<Range> &&is_character<std::remove_cv_t<std::remove_extent_t<Range>>>;

template <class T>
inline constexpr bool is_string = false;
template <class Unit, class... Others>
inline constexpr bool is_string<std::basic_string<Unit, Others...>> = true;

template <class Range>
concept writable_bytes =
    byte_range<Range> && !is_string<std::remove_cvref_t<Range>> &&
    !std::is_const_v<std::remove_pointer_t<decltype(std::data(std::declval<Range &>()))>>;

} // namespace detail

// Bytes to read: a std::string_view, a literal without its terminator, a null-terminated const char
// *, or any contiguous range of char, unsigned char, std::byte or char8_t. Does not own them.
//
// An array of char that is not a literal does not convert, since only its owner knows whether all
// of it is text: pass std::span(array) for all of it, std::string_view(array) for the text up to a
// null.
class byte_view {
public:
  constexpr byte_view() noexcept = default;
  constexpr byte_view(const void *data, std::size_t size) noexcept : data_(data), size_(size) {}

  template <detail::byte_range Range>
  requires(!detail::is_character_array<Range>) constexpr byte_view(const Range &range) noexcept
      : data_(std::data(range)), size_(std::size(range)) {}

  template <class Character, std::size_t length>
  requires(detail::is_character<Character>) consteval byte_view(
      const Character (&literal)[length]) noexcept
      : data_(literal), size_(literal[length - 1] == Character() ? length - 1 : length) {}
  template <class Character, std::size_t length>
  requires(detail::is_character<Character>) byte_view(Character (&array)[length])
  = delete;

  template <class Pointer>
  requires(std::is_same_v<Pointer, const char *>) constexpr byte_view(Pointer text) noexcept
      : byte_view(std::string_view(text)) {}

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
  template <detail::writable_bytes Range>
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
