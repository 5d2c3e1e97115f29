// page_traits.hpp - what a translator must know of a code page beyond its tables, by the type of
// ICU's converter.
#ifndef NLS2_DETAIL_PAGE_TRAITS_HPP
#define NLS2_DETAIL_PAGE_TRAITS_HPP

#include <algorithm>
#include <initializer_list>
#include <unicode/ucnv.h>

namespace nls2::detail {

inline bool is_one_of(UConverterType type, std::initializer_list<UConverterType> types) noexcept {
  return std::find(types.begin(), types.end(), type) != types.end();
}

// Every byte is a character.
inline bool is_single_byte(UConverterType type) noexcept {
  return is_one_of(type, {UCNV_SBCS, UCNV_LATIN_1, UCNV_US_ASCII});
}

// Neither shift states nor a signature: a character is the same bytes wherever it is.
inline bool is_stateless(UConverterType type) noexcept {
  return is_single_byte(type) ||
         is_one_of(type, {UCNV_MBCS, UCNV_UTF8, UCNV_CESU8, UCNV_UTF16_BigEndian,
                          UCNV_UTF16_LittleEndian, UCNV_UTF32_BigEndian, UCNV_UTF32_LittleEndian});
}

// No character but U+0000 has a zero byte, and U+0000 has one.
inline bool null_is_zero_byte(UConverterType type) noexcept {
  return is_single_byte(type) || is_one_of(type, {UCNV_MBCS, UCNV_UTF8, UCNV_EBCDIC_STATEFUL});
}

// A byte can stand for a supplementary character, or for a sequence.
inline bool can_grow_in_units(UConverterType type) noexcept {
  return is_one_of(type, {UCNV_SCSU, UCNV_BOCU1, UCNV_ISCII, UCNV_SBCS});
}

// Text may leave a mode open that a blank after it closes.
inline bool blank_depends_on_text(UConverterType type) noexcept {
  return is_one_of(type, {UCNV_UTF7, UCNV_IMAP_MAILBOX, UCNV_SCSU, UCNV_ISCII, UCNV_HZ,
                          UCNV_COMPOUND_TEXT}) ||
         (type >= UCNV_LMBCS_1 && type <= UCNV_LMBCS_LAST);
}

// The first character of all brings a signature or a header.
inline bool first_brings_more(UConverterType type) noexcept {
  return is_one_of(type, {UCNV_UTF16, UCNV_UTF32, UCNV_ISO_2022});
}

// ICU resets a converter that comes to the end of its input without an error; but some of these
// then forget their header.
inline bool needs_reset(UConverterType type) noexcept { return type == UCNV_ISO_2022; }

} // namespace nls2::detail

#endif
