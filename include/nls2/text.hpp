// text.hpp - whole texts from one code page to another, and Unicode signatures.
#ifndef NLS2_TEXT_HPP
#define NLS2_TEXT_HPP

#include "nls2/bytes.hpp"
#include "nls2/code_page.hpp"
#include "nls2/detail/common.hpp"
#include "nls2/error.hpp"
#include "nls2/translator.hpp"

#include <bit>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <string>
#include <string_view>

namespace nls2 {
inline namespace NLS2_MODE {

// What the conversions share. Each has a strict form, which fails if a byte or a character does not
// convert, and a form with `replaced`, which does what ICU does: it writes a substitution
// character, or drops an ignorable one, and counts both. Nulls are characters like any other. Each
// call opens a translator; to convert many texts, keep one yourself. The result is empty on
// failure. Errors:
//
//   10, 12  invalid_text, of the strict form; the exception describes the problem
//   31  too_long: more than 2,147,483,647 bytes
//   32  no_memory
//   37  invalid_argument: an empty page
//   other  ICU's

// One code page to another.
[[nodiscard]] inline std::string translate(const code_page &from, const code_page &to,
                                           byte_view text, error_ref error NLS2_MAY_OMIT) {
  translator opened(from, to, {}, error);
  return opened ? opened.translate(text, error) : std::string();
}
[[nodiscard]] inline std::string translate(const code_page &from, const code_page &to,
                                           byte_view text, std::size_t &replaced,
                                           error_ref error NLS2_MAY_OMIT) {
  replaced = 0;
  translator opened(from, to, {.bad = on_bad::replace}, error);
  std::string out;
  if (opened) {
    const field_result result = opened.translate(text, out);
    opened.report(result, error);
    replaced = result.replaced;
  }
  return out;
}

namespace detail {

// Calls a function with the page of UTF-16 in the machine's byte order, without a signature.
template <class Call>
std::string by_utf16(error_ref error, Call call) {
  const code_page page(std::endian::native == std::endian::little ? "UTF-16LE" : "UTF-16BE", error);
  return page ? call(page) : std::string();
}

inline std::u16string units_of(const std::string &bytes) {
  std::u16string units(bytes.size() / sizeof(char16_t), u'\0');
  std::memcpy(units.data(), bytes.data(), units.size() * sizeof(char16_t));
  return units;
}

inline byte_view bytes_of(std::u16string_view units) noexcept {
  return {units.data(), units.size() * sizeof(char16_t)};
}

} // namespace detail

// A code page to UTF-16.
[[nodiscard]] inline std::u16string to_utf16(const code_page &from, byte_view text,
                                             error_ref error NLS2_MAY_OMIT) {
  return detail::units_of(detail::by_utf16(
      error, [&](const code_page &to) { return translate(from, to, text, error); }));
}
[[nodiscard]] inline std::u16string to_utf16(const code_page &from, byte_view text,
                                             std::size_t &replaced, error_ref error NLS2_MAY_OMIT) {
  replaced = 0;
  return detail::units_of(detail::by_utf16(
      error, [&](const code_page &to) { return translate(from, to, text, replaced, error); }));
}

// UTF-16 to a code page.
[[nodiscard]] inline std::string from_utf16(const code_page &to, std::u16string_view text,
                                            error_ref error NLS2_MAY_OMIT) {
  return detail::by_utf16(error, [&](const code_page &from) {
    return translate(from, to, detail::bytes_of(text), error);
  });
}
[[nodiscard]] inline std::string from_utf16(const code_page &to, std::u16string_view text,
                                            std::size_t &replaced, error_ref error NLS2_MAY_OMIT) {
  replaced = 0;
  return detail::by_utf16(error, [&](const code_page &from) {
    return translate(from, to, detail::bytes_of(text), replaced, error);
  });
}

// The Unicode encoding whose signature (byte-order mark) a text begins with: ICU's name of it, a
// static text, and the signature's length in bytes. Empty and 0 if there is none.
struct unicode_signature {
  std::string_view encoding;
  std::size_t length = 0;
};

// Five bytes of the text are enough.
//
// Surprise: FF FE 00 00 is UTF-32LE, even for a text in UTF-16LE that begins with U+0000.
[[nodiscard]] inline unicode_signature detect_unicode_signature(byte_view text) noexcept {
  std::int32_t length = 0;
  std::int32_t status = 0;
  const char *begin = text.size() > 0 ? static_cast<const char *>(text.data()) : "";
  const char *name =
      NLS2_detectUnicodeSignature(begin, detail::to_int32(text.size()), &length, &status);
  return name == nullptr ? unicode_signature{}
                         : unicode_signature{name, static_cast<std::size_t>(length)};
}

} // namespace NLS2_MODE
} // namespace nls2

#endif
