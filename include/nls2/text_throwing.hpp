// text_throwing.hpp - the throwing forms of text.hpp, which includes this file.
#ifndef NLS2_TEXT_THROWING_HPP
#define NLS2_TEXT_THROWING_HPP

#include "nls2/text.hpp"

#if NLS2_HAS_EXCEPTIONS
namespace nls2 {

namespace detail {
inline constexpr const char *cannot_convert = "cannot convert the text";
} // namespace detail

inline std::size_t to_utf8(const locale &from, std::string_view text, std::span<char> out) {
  return detail::or_throw(detail::cannot_convert,
                          [&](std::error_code &error) { return to_utf8(from, text, out, error); });
}

inline std::string to_utf8(const locale &from, std::string_view text) {
  return detail::or_throw(detail::cannot_convert,
                          [&](std::error_code &error) { return to_utf8(from, text, error); });
}

inline std::size_t from_utf8(const locale &to, std::string_view text, std::span<char> out) {
  return detail::or_throw(detail::cannot_convert,
                          [&](std::error_code &error) { return from_utf8(to, text, out, error); });
}

inline std::string from_utf8(const locale &to, std::string_view text) {
  return detail::or_throw(detail::cannot_convert,
                          [&](std::error_code &error) { return from_utf8(to, text, error); });
}

inline std::size_t to_utf16(const locale &from, std::string_view text, std::span<char16_t> out) {
  return detail::or_throw(detail::cannot_convert,
                          [&](std::error_code &error) { return to_utf16(from, text, out, error); });
}

inline std::u16string to_utf16(const locale &from, std::string_view text) {
  return detail::or_throw(detail::cannot_convert,
                          [&](std::error_code &error) { return to_utf16(from, text, error); });
}

inline std::size_t from_utf16(const locale &to, std::u16string_view text, std::span<char> out) {
  return detail::or_throw(detail::cannot_convert,
                          [&](std::error_code &error) { return from_utf16(to, text, out, error); });
}

inline std::string from_utf16(const locale &to, std::u16string_view text) {
  return detail::or_throw(detail::cannot_convert,
                          [&](std::error_code &error) { return from_utf16(to, text, error); });
}

inline std::size_t translate(code_page to, code_page from, std::string_view text,
                             std::span<char> out) {
  return detail::or_throw(detail::cannot_convert, [&](std::error_code &error) {
    return translate(to, from, text, out, error);
  });
}

inline std::string translate(code_page to, code_page from, std::string_view text) {
  return detail::or_throw(detail::cannot_convert,
                          [&](std::error_code &error) { return translate(to, from, text, error); });
}

inline std::weak_ordering compare(const locale &where, std::string_view first,
                                  std::string_view second,
                                  trailing_blanks blanks = trailing_blanks::count) {
  return detail::or_throw("cannot compare the texts", [&](std::error_code &error) {
    return compare(where, first, second, blanks, error);
  });
}

inline bool contains(const locale &where, std::string_view text, std::string_view pattern,
                     letter_case letters = letter_case::exact) {
  return detail::or_throw("cannot search the text", [&](std::error_code &error) {
    return contains(where, text, pattern, letters, error);
  });
}

} // namespace nls2
#endif

#endif
