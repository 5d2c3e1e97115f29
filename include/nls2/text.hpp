// text.hpp - conversion, comparison and search of text.
#ifndef NLS2_TEXT_HPP
#define NLS2_TEXT_HPP

#include "nls2/code_page.hpp"
#include "nls2/detail/common.hpp"
#include "nls2/locale.hpp"

#include <algorithm>
#include <compare>
#include <cstddef>
#include <cstdint>
#include <iterator>
#include <limits>
#include <span>
#include <string>
#include <string_view>
#include <unicode/ucnv.h>

namespace nls2 {

// What the conversions share. Each has two forms. One returns the whole output as a string. The
// other writes to a span and returns the length written: bytes in a span of char, UTF-16 units in a
// span of char16_t. Nulls are text like any other character, and no terminator is counted; ICU may
// store one behind the output where the span has room. Bytes and characters that do not convert are
// replaced by ICU's substitutes and are no failure. A failure returns an empty string or 0. Errors:
//
//   NLS2_ERR_INVALID_LOCALE
//   4   unknown_code_page: the code page does not open
//   15  no_room: the span is too small; its contents are unspecified
//   31  too_long: more than 2,147,483,647 bytes or units go in or come out
//   other  ICU's failure to convert

namespace detail {

// Calls a C function with where to write and how much room there is.
template <class Unit, class Call>
std::size_t converted(std::size_t length, std::span<Unit> out, std::error_code &error,
                      Call call) noexcept {
  if (length > max_length) {
    error = make_status(too_long);
    return 0;
  }
  Unit nowhere[1] = {};
  std::int32_t status = 0;
  const std::int32_t written =
      call(out.empty() ? nowhere : out.data(), to_int32(out.size()), &status);
  error = make_status(status);
  return error ? 0 : static_cast<std::size_t>(written);
}

} // namespace detail

// The locale's code page to UTF-8 (NLS2_toUTF8).
inline std::size_t to_utf8(const locale &from, std::string_view text, std::span<char> out,
                           std::error_code &error) noexcept {
  return detail::converted(text.size(), out, error,
                           [&](char *to, std::int32_t room, std::int32_t *status) {
                             return NLS2_toUTF8(from.get(), detail::data_of(text),
                                                detail::to_int32(text.size()), to, room, status);
                           });
}

// UTF-8 to the locale's code page (NLS2_fromUTF8).
inline std::size_t from_utf8(const locale &to, std::string_view text, std::span<char> out,
                             std::error_code &error) noexcept {
  return detail::converted(text.size(), out, error,
                           [&](char *target, std::int32_t room, std::int32_t *status) {
                             return NLS2_fromUTF8(to.get(), target, room, detail::data_of(text),
                                                  detail::to_int32(text.size()), status);
                           });
}

// The locale's code page to UTF-16 (NLS2_toUTF16).
inline std::size_t to_utf16(const locale &from, std::string_view text, std::span<char16_t> out,
                            std::error_code &error) noexcept {
  return detail::converted(text.size(), out, error,
                           [&](char16_t *to, std::int32_t room, std::int32_t *status) {
                             return NLS2_toUTF16(from.get(), detail::data_of(text),
                                                 detail::to_int32(text.size()), to, room, status);
                           });
}

// UTF-16 to the locale's code page (NLS2_fromUTF16).
inline std::size_t from_utf16(const locale &to, std::u16string_view text, std::span<char> out,
                              std::error_code &error) noexcept {
  return detail::converted(text.size(), out, error,
                           [&](char *target, std::int32_t room, std::int32_t *status) {
                             return NLS2_fromUTF16(to.get(), detail::data_of(text), room, target,
                                                   detail::to_int32(text.size()), status);
                           });
}

// One code page to another (NLS2_TranslateString with options 0). A code page 0 is
// NLS2_ERR_INVALID_PARAMETER. To translate field after field, or with padding, use a
// field_translator, which opens its converters once.
inline std::size_t translate(code_page to, code_page from, std::string_view text,
                             std::span<char> out, std::error_code &error) noexcept {
  if (out.empty() && !text.empty()) {
    error = make_status(U_BUFFER_OVERFLOW_ERROR);
    return 0;
  }
  return detail::converted(
      text.size(), out, error, [&](char *target, std::int32_t room, std::int32_t *status) {
        std::int32_t consumed = 0;
        return NLS2_TranslateString(to.number(), target, room, from.number(), detail::data_of(text),
                                    detail::to_int32(text.size()), &consumed, 0, status);
      });
}

inline std::string to_utf8(const locale &from, std::string_view text, std::error_code &error) {
  return detail::grown<char>(text.size(), error,
                             [&](std::span<char> out) { return to_utf8(from, text, out, error); });
}

inline std::string from_utf8(const locale &to, std::string_view text, std::error_code &error) {
  return detail::grown<char>(text.size(), error,
                             [&](std::span<char> out) { return from_utf8(to, text, out, error); });
}

inline std::u16string to_utf16(const locale &from, std::string_view text, std::error_code &error) {
  return detail::grown<char16_t>(text.size(), error, [&](std::span<char16_t> out) {
    return to_utf16(from, text, out, error);
  });
}

inline std::string from_utf16(const locale &to, std::u16string_view text, std::error_code &error) {
  return detail::grown<char>(text.size(), error,
                             [&](std::span<char> out) { return from_utf16(to, text, out, error); });
}

inline std::string translate(code_page to, code_page from, std::string_view text,
                             std::error_code &error) {
  return detail::grown<char>(text.size(), error, [&](std::span<char> out) {
    return translate(to, from, text, out, error);
  });
}

namespace detail {

// Whether a text in the locale's code page has a null character. The decoded text says so: a zero
// byte is none in UTF-16, and in UTF-7 a null has no zero byte.
inline bool holds_null(const locale &where, std::string_view text,
                       std::error_code &error) noexcept {
  const code_page page = where.page(error);
  const converter decoder = error ? converter() : open_converter(page, error);
  if (error) {
    return false;
  }
  const char *from = data_of(text);
  UErrorCode failure = U_BUFFER_OVERFLOW_ERROR;
  while (failure == U_BUFFER_OVERFLOW_ERROR) {
    char16_t units[256];
    char16_t *end = units;
    failure = U_ZERO_ERROR;
    ucnv_toUnicode(decoder.get(), &end, std::end(units), &from, data_of(text) + text.size(),
                   nullptr, true, &failure);
    if (std::find(units, end, u'\0') != end) {
      return true;
    }
  }
  error = make_status(failure);
  return false;
}

// The status of two texts for a C function that measures lengths of up to `most` bytes and stops at
// a null.
inline std::error_code check_pair(const locale &where, std::string_view first,
                                  std::string_view second, std::size_t most,
                                  bool nulls_end_it) noexcept {
  if (first.size() > most || second.size() > most) {
    return make_status(too_long);
  }
  std::error_code error;
  if (nulls_end_it &&
      (holds_null(where, first, error) || (!error && holds_null(where, second, error)))) {
    return make_status(NLS2_ERR_INVALID_PARAMETER);
  }
  return error;
}

} // namespace detail

// Whether blanks at the end of a text count (u_isblank: tabs and all space separators).
enum class trailing_blanks { count, ignore };

// The order of two texts in the locale's code page, by the rules of its language at tertiary
// strength: case and accents count, punctuation too (NLS2_Strcoll). Nulls do not count in the
// order. Equivalent on failure. Errors:
//
//   NLS2_ERR_INVALID_LOCALE, NLS2_ERR_NO_MEMORY
//   NLS2_ERR_INVALID_PARAMETER  with `ignore`, a null inside a text: blanks before it would count
//                               as trailing ones
//   31  too_long: a text is longer than 32,767 bytes
//   other  open_converter's, or ICU's failure to open a collator
inline std::weak_ordering compare(const locale &where, std::string_view first,
                                  std::string_view second, trailing_blanks blanks,
                                  std::error_code &error) noexcept {
  constexpr std::size_t most = std::numeric_limits<std::int16_t>::max();
  const bool ignoring = blanks == trailing_blanks::ignore;
  error = detail::check_pair(where, first, second, most, ignoring);
  if (error) {
    return std::weak_ordering::equivalent;
  }
  std::int32_t status = 0;
  const std::int32_t order =
      NLS2_Strcoll(where.get(), detail::data_of(first), static_cast<std::int16_t>(first.size()),
                   detail::data_of(second), static_cast<std::int16_t>(second.size()),
                   ignoring ? std::uint32_t{SORT_IGNORETRAILING} : std::uint32_t{0}, &status);
  error = make_status(status);
  return order <=> 0;
}

inline std::weak_ordering compare(const locale &where, std::string_view first,
                                  std::string_view second, std::error_code &error) noexcept {
  return compare(where, first, second, trailing_blanks::count, error);
}

// Whether a search tells upper case from lower case.
enum class letter_case { exact, ignore };

// Whether a pattern occurs in a text, both in the locale's code page, unit for unit in UTF-16
// (NLS2_Findstr). With `ignore` both are put into lower case by the rules of the language first. An
// empty pattern occurs everywhere. False on failure. Errors:
//
//   NLS2_ERR_INVALID_LOCALE, NLS2_ERR_NO_MEMORY
//   NLS2_ERR_INVALID_PARAMETER  a null inside the text or the pattern: the search would end at it
//   16  U_UNSUPPORTED_ERROR, with `ignore` only: a text grows in lower case (U+0130 outside
//       Turkish), or no memory
//   31  too_long: more than 2,147,483,647 bytes
//   other  open_converter's
inline bool contains(const locale &where, std::string_view text, std::string_view pattern,
                     letter_case letters, std::error_code &error) noexcept {
  error = detail::check_pair(where, text, pattern, detail::max_length, true);
  if (error) {
    return false;
  }
  const bool ignoring = letters == letter_case::ignore;
  const std::int32_t found = NLS2_Findstr(
      where.get(), detail::data_of(text), detail::to_int32(text.size()), detail::data_of(pattern),
      detail::to_int32(pattern.size()), ignoring ? std::uint32_t{IGNORECASE} : std::uint32_t{0});
  if (found < 0) {
    error = make_status(ignoring ? std::int32_t{U_UNSUPPORTED_ERROR}
                                 : std::int32_t{NLS2_ERR_NO_MEMORY});
  }
  return found > 0;
}

inline bool contains(const locale &where, std::string_view text, std::string_view pattern,
                     std::error_code &error) noexcept {
  return contains(where, text, pattern, letter_case::exact, error);
}

} // namespace nls2

#include "nls2/text_throwing.hpp"

#endif
